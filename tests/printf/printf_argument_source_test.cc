#include "fileio/printf/printf_argument_source.h"

#include "embedded/services/array.h"

#include <gtest/gtest.h>

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;

namespace {

std::vector<double> walkRow(printfMatrixArgumentSource& source) {
    std::vector<double> row;
    while (source.hasMoreData())
        row.push_back(source.getCurrentArgumentAs<double>());
    return row;
}

// No driver of the library walks rows; hosts that do rely on this.
TEST(PrintfMatrixArgumentSource, WalksRows) {
    const ArrayPtr matrix = makeDoubles(2, 3, {0, 1, 2, 3, 4, 5});
    const vxArray* argument[] = {matrix.get()};
    printfMatrixArgumentSource source(argument);
    EXPECT_EQ(walkRow(source), (std::vector<double>{0, 2, 4}));
    EXPECT_FALSE(source.hasCurrentArg());
    source.setRow(1);
    EXPECT_EQ(source.remainingArgumentLength(), 3u);
    EXPECT_EQ(walkRow(source), (std::vector<double>{1, 3, 5}));
    source.resetRow();
    EXPECT_EQ(source.getCurrentArgumentAs<double>(), 1);
    source.resetRow();  // only a row walked to its end starts again
    EXPECT_EQ(source.remainingArgumentLength(), 3u);
    EXPECT_EQ(source.getCurrentArgumentAs<double>(), 3);
}

TEST(PrintfMatrixArgumentSource, CountsFurtherDimensionsAsColumns) {
    const ArrayPtr cube = makeNumeric(vxCHAR_CLASS, {2, 2, 2});
    const vxArray* argument[] = {cube.get()};
    printfMatrixArgumentSource source(argument);
    EXPECT_FALSE(source.canUsePercentSOptimization());
    source.setRow(1);
    EXPECT_EQ(walkRow(source).size(), 4u);
}

}  // namespace
