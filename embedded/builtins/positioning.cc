#include "embedded/builtins/positioning.h"

#include "fileio/attributes/numeric_attr.h"
#include "fileio/errors/code_list.h"
#include "fileio/errors/fi_error.h"

#include <cmath>

namespace Orvandeil::FileIO::embedded {
namespace {

int outside(double offset) {
    return offset < 0 ? code::BadOffsetBeforeBegin : code::BadOffsetAfterEnd;
}

long moved(OpenFile& file, off_t offset, int whence) {
    const bool isMoved = fseeko(file.handle.get(), offset, whence) == 0;
    const long position = isMoved ? ftello(file.handle.get()) : -1;
    if (position < 0) throw CodeError(file.failure(code::FseekFailed));
    return position;
}

}  // namespace

long wholeOffset(double offset, const std::string& label) {
    long whole = 0;
    bool isNaN = false;
    if (NumericAttr::GetInt64(offset, whole, &isNaN, nullptr)) return whole;
    const bool isFraction = std::trunc(offset) != offset;
    throw CodeError(isNaN        ? code::BadOffsetNaN
                    : isFraction ? code::BadOffsetInt
                                 : outside(offset),
                    label);
}

void seek(OpenFile& file, double offset, Origin origin) {
    if (file.stream->isScreen()) throw CodeError(file.failure(code::FseekFailed));
    const long whole = wholeOffset(offset, file.label);
    if (file.carry().FseekHandleCarryByte() != 0) throw CodeError(carryFailure(file));
    const long current = moved(file, 0, SEEK_CUR);
    // Asked of the file itself, so that what is still buffered counts.
    const long end = moved(file, 0, SEEK_END);
    const long base = origin == Origin::Begin ? 0 : origin == Origin::Current ? current : end;
    long target = 0;
    const bool tooFar = __builtin_add_overflow(base, whole, &target);
    const bool isInside = !tooFar && target >= 0 && target <= end;
    moved(file, isInside ? target : current, SEEK_SET);
    if (isInside) file.stream->forgetUnread();
    file.direction = Direction::None;
    if (isInside) return;
    throw CodeError(file.failure(!tooFar && target < 0 ? code::BadOffsetBeforeBegin
                                                       : outside(static_cast<double>(whole))));
}

void rewind(OpenFile& file) {
    seek(file, 0, Origin::Begin);
}

long tell(OpenFile& file) {
    long position = 0;
    if (file.stream->getPosition(position) == 0) return position;
    throw CodeError(file.failure(file.stream->getErrorCode()));
}

bool endOfFile(OpenFile& file) {
    file.carry().CheckFeofCarryByte();
    return file.stream->EndOfData();
}

FileError errorOf(const OpenFile& file) {
    const int code = file.stream->getErrorCode();
    return {code, fiPkStrerror(code)};
}

void clearError(OpenFile& file) {
    file.stream->clearError();
}

}  // namespace Orvandeil::FileIO::embedded
