#include "fileio/printf/printf_argument_source.h"

#include "fileio/buffers/element_conversion.h"
#include "fileio/buffers/host_array.h"
#include "fileio/errors/code_list.h"
#include "fileio/errors/identifiers.h"
#include "fileio/host/dispatch.h"
#include "fileio/host/messages.h"
#include "fileio/printf/element_range.h"

#include <typeinfo>

namespace Orvandeil::FileIO {
namespace {

// Not part of its caller, which is called for every argument.
[[gnu::noinline]] detail::Dimensions objectDimensions(const vxArray* object) {
    const detail::OwnedArray size(vxDispatchCall("size", &object, 1));
    const bool usable = size && vxArrayClassID(size.get()) == vxDOUBLE_CLASS &&
                        vxArrayIsVector(size.get()) && detail::elementCount(size.get()) >= 2;
    if (!usable) vxErrMsgId(KESTRA::printf::invalidSizeResult(vxArrayClassName(object)));
    detail::Dimensions dimensions(detail::elementCount(size.get()));
    AssignToVoidBuffer(vxUINT64_CLASS, dimensions.data(), VxData(size.get()), dimensions.size());
    return dimensions;
}

}  // namespace

printfArgumentSource::printfArgumentSource(const vxArray** arguments, std::size_t count)
    : args(arguments), argc(count) {}

printfArgumentSource::~printfArgumentSource() = default;

void printfArgumentSource::setupArg() {
    elementIndex = 0;
    if (argIndex >= argc) return clearArg();
    const vxArray* const array = args[argIndex];
    if (vxArrayClassID(array) == vxOBJECT_CLASS) {
        clearArg();
        dims = objectDimensions(array);
    } else {
        const std::size_t* const lengths = vxArrayDimensions(array);
        dims.assign(lengths, lengths + vxArrayDimensionCount(array));
    }
    argLength = detail::elementCount(std::span(dims.data(), dims.size()));
    data.emplace(array);
}

void printfArgumentSource::clearArg() {
    data.reset();
    argLength = 0;
}

bool printfArgumentSource::hasMoreData() const {
    return remainingArgumentLength() != 0 || hasMoreArgs();
}

void printfArgumentSource::setCurrentArgument(std::size_t) {}

bool printfArgumentSource::hasCurrentArg() const {
    return data.has_value();
}

bool printfArgumentSource::hasMoreArgs() const {
    return argIndex < argc;
}

bool printfArgumentSource::advanceArgument() {
    advanceArgumentIndex();
    // An argument without elements is passed by the first step already.
    if (elementIndex >= argLength) consumeArgument();
    return true;
}

void printfArgumentSource::advanceArgumentIndex() {
    ++elementIndex;
}

std::size_t printfArgumentSource::remainingArgumentLength() const {
    return argLength - elementIndex;
}

void printfArgumentSource::consumeArgument() {}

bool printfArgumentSource::canUsePercentSOptimization() {
    return data && (data->getClassID() == vxCHAR_CLASS || data->isObject());
}

bool printfArgumentSource::prepareCurrentArgument(bool allowEmpty) {
    if (!hasCurrentArg()) {
        advanceArgument();
        throw code::NotEnoughArgs;
    }
    if (!isCurrentArgumentEmpty()) return true;
    advanceArgument();
    if (!allowEmpty) throw code::EmptyArg;
    return false;
}

std::u16string_view printfArgumentSource::getCurrentArgumentAsString(std::u16string& out) {
    out.clear();
    if (!hasCurrentArg()) {
        // Lets a source that picks by number say that there is no such argument.
        advanceArgument();
        throw code::NotEnoughArgs;
    }
    if (data->isObject() && isCurrentArgumentEmpty()) {
        consumeArgument();
        throw code::EmptyArg;
    }
    const std::size_t remaining = remainingArgumentLength();
    if (!canUsePercentSOptimization()) {
#ifdef FILEIO_FAST_PATHS
        if (takeCharacterCodes(out)) return out;
#endif
        out.reserve(remaining);
        for (std::size_t i = 0; i < remaining && isCharacterCode(); ++i) {
            out += data->getIndexAs<char16_t>(elementIndex);
            advanceArgument();
        }
        if (out.empty()) advanceArgument();
        return out;
    }
    if (data->isObject()) {
        out = data->getIndexAs<std::u16string>(elementIndex);
        advanceArgument();
        return out;
    }
    const auto* characters = static_cast<const char16_t*>(data->getElements()) + elementIndex;
    consumeArgument();
    return {characters, remaining};
}

#ifdef FILEIO_FAST_PATHS
// The run of codes in one go, where every element is followed by the next one.
bool printfArgumentSource::takeCharacterCodes(std::u16string& out) {
    if (typeid(*this) != typeid(printfSequentialArgumentSource)) return false;
    const detail::PlainElements elements = plainElements();
    if (elements.count == 0) return false;
    out.resize(elements.count);
    out.resize(detail::copyCharacterCodes(elements, out.data()));
    if (out.empty()) return false;
    skipElements(out.size() - 1);
    advanceArgument();
    return true;
}
#endif

bool printfArgumentSource::isCharacterCode() const {
    return hasCurrentArg() && !isCurrentArgumentEmpty() &&
           detail::isRepresentable<std::uint16_t>(*data, elementIndex);
}

void printfArgumentSource::skipArguments(std::size_t count) {
    argIndex += count;
    setupArg();
}

detail::PlainElements printfArgumentSource::plainElements() const {
    if (!hasPlainElement()) return {};
    const vxClassID classID = data->getClassID();
    const auto* elements = static_cast<const char*>(data->getElements());
    return {classID, elements + elementIndex * fiPkGetSizeFromClassID(classID),
            argLength - elementIndex};
}

namespace {

// Whether a conversion to T can show a finite element in its own form.
template <class T>
bool isShowable(const VxData& data, std::size_t index) {
    return detail::isRepresentable<T>(data, index);
}
template <>
bool isShowable<char16_t>(const VxData& data, std::size_t index) {
    return detail::isRepresentable<std::uint16_t>(data, index);
}
template <>
bool isShowable<double>(const VxData&, std::size_t) {
    return true;
}

}  // namespace

template <class T>
Printability printfArgumentSource::checkPrintabilityByType() const {
    if (isCurrentArgumentEmpty()) return EmptyArgument;
    if (!hasCurrentArg()) return Printable;
    if (detail::isNonFinite(*data, elementIndex)) return NonFinite;
    if (data->isObject() || isShowable<T>(*data, elementIndex)) return Printable;
    return NotPrintable;
}

template FILEIO_API Printability printfArgumentSource::checkPrintabilityByType<long>() const;
template FILEIO_API Printability
printfArgumentSource::checkPrintabilityByType<unsigned long>() const;
template FILEIO_API Printability printfArgumentSource::checkPrintabilityByType<double>() const;
template FILEIO_API Printability printfArgumentSource::checkPrintabilityByType<char16_t>() const;

printfSequentialArgumentSource::printfSequentialArgumentSource(const vxArray** arguments,
                                                               std::size_t count)
    : printfArgumentSource(arguments, count) {
    setupArg();
}

void printfSequentialArgumentSource::consumeArgument() {
    ++argIndex;
    setupArg();
}

bool printfNumberedArgumentSource::hasMoreData() const {
    return false;
}

void printfNumberedArgumentSource::setCurrentArgument(std::size_t n) {
    argIndex = n - 1;
    setupArg();
}

bool printfNumberedArgumentSource::advanceArgument() {
    if (!hasCurrentArg()) throw code::NumberedMoreThanArgc;
    if (!isCurrentArgumentScalar()) throw code::NonScalarNumbered;
    return true;
}

printfMatrixArgumentSource::printfMatrixArgumentSource(const vxArray** arg)
    : printfArgumentSource(arg, 1) {
    setupArg();
}

bool printfMatrixArgumentSource::hasCurrentArg() const {
    return !dims.empty() && column < columnCount();
}

bool printfMatrixArgumentSource::hasMoreArgs() const {
    return false;
}

void printfMatrixArgumentSource::advanceArgumentIndex() {
    ++column;
    if (column <= columnCount()) elementIndex += dims.front();
}

std::size_t printfMatrixArgumentSource::remainingArgumentLength() const {
    return columnCount() - column;
}

bool printfMatrixArgumentSource::canUsePercentSOptimization() {
    return data && data->isObject();
}

void printfMatrixArgumentSource::setRow(std::size_t r) {
    rowStart = r;
    elementIndex = r;
    resetRow();
}

void printfMatrixArgumentSource::resetRow() {
    if (elementIndex >= argLength) elementIndex = rowStart;
    column = 0;
}

std::size_t printfMatrixArgumentSource::columnCount() const {
    if (dims.empty()) return 0;
    return detail::elementCount(std::span(dims.data(), dims.size()).subspan(1));
}

}  // namespace Orvandeil::FileIO
