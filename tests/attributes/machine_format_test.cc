#include "fileio/attributes/machine_format.h"

#include "fileio/host/data_sizes.h"
#include "fileio/host/exception.h"

#include <string>

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::MachineFormat;

TEST(MachineFormat, ResolvesNames) {
    const int native = vxDataSizeNative();
    const int none = vxDataSizeCount() - 1;
    constexpr int before = 3;
    const struct {
        int line;
        std::string name;
        int index;
        bool valid = true;
    } rows[] = {
        {__LINE__, "n", native},
        {__LINE__, "NaTiVe", native},
        {__LINE__, "L", 0},
        {__LINE__, "b", 1},
        {__LINE__, "a", 5},
        {__LINE__, "S", 6},
        {__LINE__, vxDataSizeName(6), 6},
        {__LINE__, "LITTLE-endian", 0},
        {__LINE__, "", none, false},
        {__LINE__, "x", none, false},
        {__LINE__, "\t", none, false},
        {__LINE__, " ", before, false},    // refused, and nothing changes
        {__LINE__, "  ", none, false},     // no match for formats without a name
        {__LINE__, "nativ", none, false},  // no abbreviations
        {__LINE__, "\xCC", none, false},   // no letter, though 'L' with a bit added
    };
    for (const auto& row : rows) {
        MachineFormat format;
        format.dataSizeType = before;
        format = row.name.c_str();
        EXPECT_EQ(format.valid, row.valid) << row.line;
        EXPECT_EQ(format.dataSizeType, row.index) << row.line;
        EXPECT_EQ(format.text, "") << row.line;
        if (row.index != before) {
            EXPECT_EQ(MachineFormat(row.name.c_str()).dataSizeType, row.index) << row.line;
        }
    }
}

TEST(MachineFormat, ValidatesByLegacyNumber) {
    MachineFormat format;
    EXPECT_EQ(format.dataSizeType, vxDataSizeNative());
    EXPECT_EQ(format.errorMessageNumber, 34);
    EXPECT_NO_THROW(format.Validate());

    format = "no such format";
    const MachineFormat copy = format;
    EXPECT_EQ(copy.dataSizeType, vxDataSizeCount() - 1);
    EXPECT_FALSE(copy.valid);
    try {
        copy.Validate();
        ADD_FAILURE() << "an invalid format passed";
    } catch (const foundation::core::except::IMsgIDException& error) {
        EXPECT_EQ(error.GetID(), "KESTRA:legacy_two_part:badmachformat_vx");
    }
}

}  // namespace
