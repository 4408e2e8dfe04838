#pragma once

#include "fileio/buffers/vx_data.h"
#include "fileio/export.h"
#include "fileio/memory_operation_overloads.h"
#include "fileio/printf/printability.h"

#include <cstddef>
#include <optional>
#include <span>
#include <string>
#include <string_view>

#include <boost/container/small_vector.hpp>

namespace Orvandeil::FileIO {

namespace detail {

// A run of elements of one class, as they lie in their array.
struct PlainElements {
    vxClassID classID = vxUNKNOWN_CLASS;
    const char* first = nullptr;
    std::size_t count = 0;
};

// The lengths of an array's dimensions, which seldom are many.
using Dimensions = boost::container::small_vector<std::size_t, 4>;

// Copies the leading elements that are character codes, and returns their number.
std::size_t copyCharacterCodes(const PlainElements& elements, char16_t* out);

}  // namespace detail

// Hands the elements of the argument arrays, which it does not own, to conversions: one at a time,
// in column-major order. Failures are thrown as int codes; errors of element conversions and of an
// object's "size" are raised as the host's typed errors.
class FILEIO_API printfArgumentSource : public fiMemoryOperationOverloads {
public:
    // Stands on no argument until setupArg() or setCurrentArgument().
    printfArgumentSource(const vxArray** args, std::size_t argc);
    printfArgumentSource(const printfArgumentSource&) = delete;
    printfArgumentSource& operator=(const printfArgumentSource&) = delete;
    virtual ~printfArgumentSource();

    // Whether any element, or any argument that is still to be visited, remains.
    virtual bool hasMoreData() const;
    // Makes argument `n`, counted from 1, the current one, where the source can choose.
    virtual void setCurrentArgument(std::size_t n);
    virtual bool hasCurrentArg() const;
    // Counts the current argument too, an empty one included.
    virtual bool hasMoreArgs() const;
    // Steps to the next element, and from the last one to the next argument.
    virtual bool advanceArgument();
    virtual void advanceArgumentIndex();
    virtual std::size_t remainingArgumentLength() const;
    // Leaves the current argument.
    virtual void consumeArgument();
    // Whether "%s" takes text from the argument as it is instead of collecting character codes.
    virtual bool canUsePercentSOptimization();

    // Goes to the first element of the argument at argIndex, or to no argument behind the last.
    // An object's shape is asked of its function "size"; a result that is no double vector of two
    // elements or more raises "KESTRA:printf:invalidSizeResult".
    void setupArg();
    void clearArg();

    bool isCurrentArgumentEmpty() const { return argLength == 0; }
    bool isCurrentArgumentScalar() const { return argLength == 1; }

    // True when there is an element to take. Throws NotEnoughArgs without a current argument. An
    // argument without elements is left behind: false where that is allowed, else EmptyArg is
    // thrown.
    bool prepareCurrentArgument(bool allowEmpty);

    // The current element as T (double, float, long, unsigned long, char16_t), stepping past it.
    template <class T>
    T getCurrentArgumentAs() {
        const T value = data->getIndexAs<T>(elementIndex);
        advanceArgument();
        return value;
    }

    // The text that "%s" prints, stepping past what it came from: the rest of a char array, one
    // element of an object, or the run of numbers that are character codes. A view of the
    // argument or of `out`. Throws NotEnoughArgs, or EmptyArg for an object without elements.
    std::u16string_view getCurrentArgumentAsString(std::u16string& out);

    // How the current element can be shown by a conversion to T (long, unsigned long, double,
    // char16_t). Without a current argument it is printable: taking it then fails as it should.
    template <class T>
    Printability checkPrintabilityByType() const;

    // The elements that the current argument still has; none for an object, and none without a
    // current argument.
    detail::PlainElements plainElements() const;
    // Whether there are any.
    bool hasPlainElement() const {
        return data && data->getElements() != nullptr && !isCurrentArgumentEmpty();
    }
    // The arguments from the current one on; none when an element of that one was taken already.
    std::span<const vxArray* const> wholeArguments() const {
        if (elementIndex != 0 || argIndex >= argc) return {};
        return {args + argIndex, argc - argIndex};
    }
    // Goes on with a later argument.
    void skipArguments(std::size_t count);
    // Steps past elements that are not the last.
    void skipElements(std::size_t count) { elementIndex += count; }

protected:
    friend struct LayoutProbe;

    const vxArray** args;
    std::size_t argc;
    std::size_t argIndex = 0;
    std::size_t argLength = 0;
    detail::Dimensions dims;
    std::size_t elementIndex = 0;
    std::optional<VxData> data;  // none without a current argument

private:
    bool isCharacterCode() const;
    bool takeCharacterCodes(std::u16string& out);
};

// All elements of the first argument, then those of the next.
class FILEIO_API printfSequentialArgumentSource : public printfArgumentSource {
public:
    // Stands on the first argument.
    printfSequentialArgumentSource(const vxArray** args, std::size_t argc);

    void consumeArgument() override;
};

// Arguments picked by number; each must be a scalar. Throws NumberedMoreThanArgc for a number
// beyond the arguments, NonScalarNumbered for another shape.
class FILEIO_API printfNumberedArgumentSource : public printfArgumentSource {
public:
    using printfArgumentSource::printfArgumentSource;

    bool hasMoreData() const override;
    void setCurrentArgument(std::size_t n) override;
    // Checks the current argument and stays on it.
    bool advanceArgument() override;
};

// The elements of one matrix along a row. More than two dimensions count as columns from the
// second on.
class FILEIO_API printfMatrixArgumentSource : public printfArgumentSource {
public:
    // Stands on the first row.
    explicit printfMatrixArgumentSource(const vxArray** arg);

    bool hasCurrentArg() const override;
    bool hasMoreArgs() const override;
    void advanceArgumentIndex() override;
    // The columns left in the row.
    std::size_t remainingArgumentLength() const override;
    bool canUsePercentSOptimization() override;

    // Goes to the first element of row `r`, counted from 0 and below the number of rows.
    void setRow(std::size_t r);
    // Goes back to the first column, after a row was walked to its end.
    void resetRow();

private:
    friend struct LayoutProbe;

    std::size_t columnCount() const;

    std::size_t rowStart = 0;
    std::size_t column = 0;
};

}  // namespace Orvandeil::FileIO
