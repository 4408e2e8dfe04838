#include "fileio/attributes/machine_format.h"

#include "fileio/host/data_sizes.h"
#include "tests/support/raised.h"

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::MachineFormat;

TEST(MachineFormat, ResolvesNames) {
    const int native = vxDataSizeNative();
    const int none = vxDataSizeCount() - 1;
    constexpr int before = 3;
    const auto indexOf = [&](const char* name) {
        MachineFormat format;
        format.dataSizeType = before;
        format = name;
        EXPECT_EQ(format.valid, format.dataSizeType != none && format.dataSizeType != before);
        EXPECT_EQ(format.text, "");
        return format.dataSizeType;
    };
    EXPECT_EQ(indexOf("N"), native);
    EXPECT_EQ(indexOf("NaTiVe"), native);
    EXPECT_EQ(indexOf("L"), 0);
    EXPECT_EQ(indexOf("a"), 5);
    EXPECT_EQ(indexOf(vxDataSizeName(6)), 6);
    EXPECT_EQ(indexOf("LITTLE-endian"), 0);
    EXPECT_EQ(indexOf(" "), before) << "refused, and nothing changes";
    for (const char* name : {"", "x", "\t", "  ", "nativ", "\xCC"})
        EXPECT_EQ(indexOf(name), none) << name;
}

TEST(MachineFormat, ValidatesByLegacyNumber) {
    const MachineFormat native, invalid("no such format"), copy = invalid;
    EXPECT_EQ(native.dataSizeType, vxDataSizeNative());
    EXPECT_EQ(native.errorMessageNumber, 34);
    EXPECT_EQ(copy.dataSizeType, vxDataSizeCount() - 1);
    EXPECT_EQ(fileio_tests::raisedBy([&] { native.Validate(); }), "");
    EXPECT_EQ(fileio_tests::raisedBy([&] { copy.Validate(); }),
              "KESTRA:legacy_two_part:badmachformat_vx");
}

}  // namespace
