#pragma once

#include "fileio/errors/stored_exception.h"
#include "fileio/host/arrays.h"
#include "fileio/memory_operation_overloads.h"

#include <boost/exception_ptr.hpp>

namespace Orvandeil::FileIO {

// An argument of a binary transfer that is a number or two. It is parsed when it is built, but an
// error is kept until Validate(), so that a caller can build all its attributes first and then
// validate them in its own order.
class FILEIO_API NumericAttr : public fiMemoryOperationOverloads {
public:
    // `defaultError` is what Validate raises when no better error was set.
    template <class Err>
    explicit NumericAttr(const Err& defaultError) : error(detail::storedException(defaultError)) {}
    NumericAttr(const NumericAttr&) = default;
    NumericAttr& operator=(const NumericAttr&) = default;
    virtual ~NumericAttr();

    virtual bool IsValid() const;
    // Raises the stored error of an invalid attribute; does nothing for a valid one.
    virtual void Validate() const;

    template <class Err>
    void SetError(const Err& newError) {
        error = detail::storedException(newError);
        valid = false;
    }

    // Truncates `d` toward zero into `out`. True exactly when `d` is a whole number that a signed
    // 64-bit integer holds. An infinity stores +1 or -1 by its sign, NaN and other values out of
    // range store 0. The two pointers may be null.
    static bool GetInt64(double d, long& out, bool* isNaN, bool* isInf);
    // The same of an array's first element; false for an empty or non-numeric array and for an
    // unsigned value beyond the signed range.
    static bool GetInt64(const vxArray* array, long& out, bool* isNaN, bool* isInf);

    // `d` truncated toward zero to 32 bits; `replacement` when it is too large or NaN, the
    // smallest value when it is too small.
    static int ReplaceOutOfRange(double d, int replacement);

protected:
    bool valid = true;
    boost::exception_ptr error;
};

}  // namespace Orvandeil::FileIO
