#include "fileio/errors/code_list.h"
#include "fileio/host/memory.h"
#include "fileio/printf/fout_format_pieces.h"
#include "fileio/printf/printf_argument_source.h"
#include "fileio/text/tcodn_stream.h"

#include <algorithm>
#include <bit>
#include <cstdio>
#include <cstring>
#include <memory>

namespace Orvandeil::FileIO {
namespace {

struct FreeMemory {
    void operator()(char* block) const { vxMemoryFree(block); }
};
using Block = std::unique_ptr<char, FreeMemory>;

// The digits that every value of U has in its widest form.
template <class U>
constexpr int octalDigits = sizeof(U) == 8 ? 22 : 11;
template <class U>
constexpr int decimalDigits = sizeof(U) == 8 ? 20 : 10;
template <class U>
constexpr int hexDigits = sizeof(U) == 8 ? 16 : 8;

unsigned long checkLength(int printed, int expected) {
    if (printed != expected) throw code::InternalError;
    return static_cast<unsigned long>(printed);
}

}  // namespace

template <class U, class F>
void foutFormatPieceForOUXbt<U, F>::printByType(TcodnStream* out, printfArgumentSource* source) {
    if (!source->prepareCurrentArgument(true)) return printWidthBuffer(out, 0);
    const U bits = std::bit_cast<U>(source->getCurrentArgumentAs<F>());
    char digits[maxDigits + 1];
    const unsigned long digitCount = formatBitPattern(bits, digits);
    const unsigned long fieldLength = getDigitFieldLength(digitCount);

    const Block text(static_cast<char*>(vxMemoryAllocate(maxPrefix + fieldLength + 1)));
    if (!text) throw code::NoMemory;
    char* end = text.get();
    if (hasFlag(Alternate)) end += writePrefix(end);
    end = std::fill_n(end, fieldLength - digitCount, '0');
    end = std::copy_n(digits, digitCount, end);
    *end = '\0';

    if (out->needsBufferSize()) {
        const auto total = static_cast<unsigned long>(end - text.get()) + 1;
        out->setBufferSize(std::max(total, static_cast<unsigned long>(width.getEffective())) + 1);
    }
    printField(out, isLeftJustified() ? "%-*s" : "%*s", width.getEffective(), text.get());
}

template <class U, class F>
Printability foutFormatPieceForOUXbt<U, F>::decidePrintMode(printfArgumentSource*) const {
    return Printable;
}

template <class U, class F>
bool foutFormatPieceForOUXbt<U, F>::isZeroFilled() const {
    return !isLeftJustified() && hasFlag(ZeroPad) && !hasPrecision();
}

template <class U, class F>
unsigned long foutFormatPieceForOUXbt<U, F>::getDigitFieldLength(unsigned long digits) const {
    if (hasPrecision()) {
        return std::max(digits, static_cast<unsigned long>(precision.getEffective()));
    }
    if (isZeroFilled()) return std::max(digits, static_cast<unsigned long>(width.getEffective()));
    return digits;
}

template <class U, class F>
unsigned long foutFormatPieceForOUXbt<U, F>::writePrefix(char*) const {
    return 0;
}

template <class U, class F>
unsigned long foutFormatPieceForObt<U, F>::formatBitPattern(U bits, char* digits) const {
    constexpr int count = octalDigits<U>;
    return checkLength(std::snprintf(digits, this->maxDigits + 1, "%*.*lo", count, count,
                                     static_cast<unsigned long>(bits)),
                       count);
}

template <class U, class F>
unsigned long foutFormatPieceForObt<U, F>::getDigitFieldLength(unsigned long digits) const {
    const unsigned long length = foutFormatPieceForOUXbt<U, F>::getDigitFieldLength(digits);
    return this->hasFlag(Alternate) && length == digits ? length + 1 : length;
}

template <class U, class F>
unsigned long foutFormatPieceForUbt<U, F>::formatBitPattern(U bits, char* digits) const {
    constexpr int count = decimalDigits<U>;
    return checkLength(std::snprintf(digits, this->maxDigits + 1, "%*.*lu", count, count,
                                     static_cast<unsigned long>(bits)),
                       count);
}

template <class U, class F>
foutFormatPieceForXbt<U, F>::foutFormatPieceForXbt(const foutFormatPieceInitBlock& init)
    : foutFormatPieceForOUXbt<U, F>(init), upperCase(init.written.ends_with(u'X')) {}

template <class U, class F>
unsigned long foutFormatPieceForXbt<U, F>::formatBitPattern(U bits, char* digits) const {
    constexpr int count = hexDigits<U>;
    return checkLength(std::snprintf(digits, this->maxDigits + 1, upperCase ? "%*.*lX" : "%*.*lx",
                                     count, count, static_cast<unsigned long>(bits)),
                       count);
}

template <class U, class F>
unsigned long foutFormatPieceForXbt<U, F>::writePrefix(char* out) const {
    std::memcpy(out, upperCase ? "0X" : "0x", 2);
    return 2;
}

template class foutFormatPieceForObt<unsigned long, double>;
template class foutFormatPieceForObt<unsigned int, float>;
template class foutFormatPieceForUbt<unsigned long, double>;
template class foutFormatPieceForUbt<unsigned int, float>;
template class foutFormatPieceForXbt<unsigned long, double>;
template class foutFormatPieceForXbt<unsigned int, float>;

}  // namespace Orvandeil::FileIO
