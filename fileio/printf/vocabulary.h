#pragma once

namespace Orvandeil::FileIO {

// What the pieces of an output format are made of. The numbers are part of the interface between
// parser, pieces and driver.

enum PrintfFormat : int {
    NoConversion = 0,  // a literal run, "%%" included
    ConvD = 1,
    ConvI = 2,
    ConvO = 3,
    ConvU = 4,
    ConvX = 5,  // x and X; here as for e and g, the case lives in the printf text only
    ConvE = 6,
    ConvF = 7,
    ConvG = 8,
    ConvS = 9,
    ConvC = 10
};

enum PrintfSubformat : int {
    NoSubformat = 0,
    SubH = 1,
    SubL = 2,
    SubT = 3,  // the bits of the value as a single
    SubB = 4   // the bits of the value as a double
};

// A set of these bits.
enum PrintFormatFlags : int {
    NoFlags = 0,
    LeftJustify = 1,  // -
    ShowSign = 2,     // +
    SpaceSign = 4,    // blank
    Alternate = 8,    // #
    ZeroPad = 16      // 0
};

constexpr PrintFormatFlags operator|(PrintFormatFlags a, PrintFormatFlags b) {
    return static_cast<PrintFormatFlags>(static_cast<int>(a) | static_cast<int>(b));
}

// Where a width or precision comes from.
enum WidthPrecisionFieldType : int {
    FieldLiteral = 0,  // written in the format
    FieldAbsent = 1,
    FieldNumberedArgument = 2,  // *n$
    FieldNextArgument = 3       // *
};

}  // namespace Orvandeil::FileIO
