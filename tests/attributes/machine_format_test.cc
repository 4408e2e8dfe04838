#include "fileio/attributes/machine_format.h"

#include "fileio/host/data_sizes.h"
#include "tests/support/raised.h"

#include <gtest/gtest.h>

namespace {

using Orvandeil::FileIO::MachineFormat;

TEST(MachineFormat, ValidatesByLegacyNumber) {
    MachineFormat assigned("big-endian");
    assigned = " ";
    EXPECT_EQ(assigned.dataSizeType, 1) << "refused, and nothing changes";
    EXPECT_EQ(assigned.text, "");
    EXPECT_FALSE(assigned.valid);
    assigned = "\xCC";
    EXPECT_EQ(assigned.dataSizeType, vxDataSizeCount() - 1);
    assigned = vxDataSizeName(6);
    EXPECT_TRUE(assigned.valid);
    const MachineFormat native, invalid("no such format"), copy = invalid;
    EXPECT_EQ(native.dataSizeType, vxDataSizeNative());
    EXPECT_EQ(native.errorMessageNumber, 34);
    EXPECT_EQ(copy.dataSizeType, vxDataSizeCount() - 1);
    EXPECT_EQ(fileio_tests::raisedBy([&] { native.Validate(); }), "");
    EXPECT_EQ(fileio_tests::raisedBy([&] { copy.Validate(); }),
              "KESTRA:legacy_two_part:badmachformat_vx");
}

}  // namespace
