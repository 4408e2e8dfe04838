#pragma once

namespace Orvandeil::FileIO {

// What a piece of an input format reads.
enum class FORMAT : int {
    Literal,
    Integer,       // d
    IntegerOrHex,  // i
    Unsigned,      // u
    Hex,           // x, X
    Octal,         // o
    Float,         // e, f, g, E, G
    String,        // s
    Char,          // c
    Scanset,       // [...]
    Error
};

// The length letter of a numeric conversion.
enum class SUB_FORMAT : int {
    None,
    Short,  // h
    Long    // l
};

}  // namespace Orvandeil::FileIO
