#pragma once

#include "embedded/builtins/code_error.h"

namespace cli {

// A numeric code (errno values included) that ends a verb. The text says where it happened.
using CodeError = Orvandeil::FileIO::embedded::CodeError;

}  // namespace cli
