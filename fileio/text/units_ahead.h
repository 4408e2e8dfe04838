#pragma once

#include "fileio/streams/file_read_buffer.h"
#include "fileio/streams/file_stream.h"
#include "fileio/text/direct_transcoding.h"
#include "fileio/text/input_string_stream.h"

#include <cstddef>
#include <string_view>
#include <typeinfo>

namespace Orvandeil::FileIO::detail {

// The units that a stream will decode next, as far as their bytes lie in memory and need no
// converter. Taking some leaves the stream as reading them one by one would have; none are ahead in
// a stream of a class derived from the library's own, which may watch how it is read.
class UnitsAhead {
public:
    enum class Verdict { Take, TakeLast, GiveBack };

    explicit UnitsAhead(TcodnStream& source) : stream(source) {
        // Compared by address: a false alarm costs time only.
        const std::type_info* const type = &typeid(source);
        if (type == &typeid(fileStream)) {
            file = static_cast<fileStream*>(&source);
        } else if (type == &typeid(inputStringStream)) {
            text = static_cast<inputStringStream*>(&source);
        }
    }

    // Asks about one unit after the other, and takes those before the first that is given back. The
    // question must not throw. False when there was no such unit: what comes next has to be read.
    template <class Judge>
    bool takeWhile(Judge judge);

    // Takes one unit if it is an ASCII character of a file, which is the least that one can cost.
    bool takeAscii(char16_t& unit) {
        if (!file || !stream.readsAsciiAsIs()) return false;
        const std::string_view ahead = bytesReadAhead(file->file);
        if (ahead.empty() || static_cast<signed char>(ahead.front()) < 0) return false;
        const auto byte = static_cast<unsigned char>(ahead.front());
        unit = byte;
        stream.begunMidCharacter = false;
        file->lastByteRead = byte;
        file->recentBytes.add(byte);
        takeReadAhead(file->file, ahead.data() + 1);
        return true;
    }

    // Takes up to `n` units, and returns their number and that of their bytes: as many as there are
    // in memory; of a file, which is read in larger pieces, only if it is enough.
    unsigned long takeUnits(char16_t* out, unsigned long n, std::size_t& consumed);

    DirectForm form() const;
    std::string_view bytes() const;
    // Takes the bytes before `next`, as if they and `givenBack` bytes more had been read and the
    // latter given back.
    void take(const char* begin, const char* next, std::size_t givenBack);
    // The length of the character at `next`; 0 when it needs the converter or more bytes.
    std::size_t decodeUnit(DirectForm form, const char* next, const char* end,
                           char16_t& unit) const {
        if (form == DirectForm::Utf8) {
            const bool isAscii = static_cast<signed char>(*next) >= 0;
            if (!isAscii) return decodeUtf8Character(next, end, unit);
            unit = static_cast<unsigned char>(*next);
            return 1;
        }
        return decodeOther(form, next, end, unit);
    }
    // Bytes below are units by themselves.
    unsigned firstCoded(DirectForm form) const;

private:
    std::size_t decodeOther(DirectForm form, const char* next, const char* end,
                            char16_t& unit) const;

    TcodnStream& stream;
    fileStream* file = nullptr;
    inputStringStream* text = nullptr;
};

template <class Judge>
bool UnitsAhead::takeWhile(Judge judge) {
    const DirectForm coding = form();
    if (coding == DirectForm::None) return false;
    const std::string_view ahead = bytes();
    const char* const end = ahead.data() + ahead.size();
    const char* next = ahead.data();
    const unsigned coded = firstCoded(coding);
    while (next != end) {
        char16_t unit = static_cast<unsigned char>(*next);
        std::size_t length = 1;
        if (unit >= coded) length = decodeUnit(coding, next, end, unit);
        if (length == 0) break;
        const Verdict verdict = judge(unit);
        const bool isGivenBack = verdict == Verdict::GiveBack;
        if (!isGivenBack) next += length;
        if (verdict == Verdict::Take) continue;
        take(ahead.data(), next, isGivenBack ? length : 0);
        return true;
    }
    take(ahead.data(), next, 0);
    return false;
}

}  // namespace Orvandeil::FileIO::detail
