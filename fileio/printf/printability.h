#pragma once

namespace Orvandeil::FileIO {

// How the current element of an argument can be shown by a conversion.
enum Printability : int {
    NotPrintable = 0,   // not in the conversion's own form: in exponent form
    EmptyArgument = 1,  // no element: only padding
    NonFinite = 2,      // as the word Inf or NaN
    Printable = 3
};

}  // namespace Orvandeil::FileIO
