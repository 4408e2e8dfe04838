#pragma once

#include "fileio/buffers/output_buffer.h"
#include "fileio/export.h"
#include "fileio/streams/stream.h"

#include <cstddef>
#include <optional>
#include <string>
#include <string_view>

#include <unicode/ucnv.h>

namespace Orvandeil::FileIO {

namespace detail {
class AsciiOutput;
class ByteTable;
class UnitsAhead;
enum class DirectForm : unsigned char;
}  // namespace detail

// A stream that carries text: it decodes the bytes of its encoding into UTF-16 and encodes UTF-16
// into them, with one ICU converter and ICU's substitution callbacks. Characters beyond the Basic
// Multilingual Plane are decoded as the single unit U+001A, so that no engine meets surrogates.
//
// Without an encoding name the encoding is decided by DetectCharset at the first need; until a
// byte other than 7-bit ASCII is read there is none.
class FILEIO_API TcodnStream : public stream {
public:
    // An unknown name raises "KESTRA:iofun:InvalidEncoding". Sets the numeric locale to "C".
    explicit TcodnStream(std::string encoding);
    ~TcodnStream() override;

    // Writes `n` code units as they are, in native byte order. Returns the units written.
    virtual unsigned long PutNCharacters(unsigned long n, const char16_t* text);

    // The name of the character set of the data from `startOffset` on.
    virtual std::string DetectCharset(unsigned long startOffset) const = 0;

    // The converter, opened by DetectCharset(n) if there is none yet; `n` is the number of leading
    // ASCII bytes of the read in progress.
    UConverter* GetConv(unsigned long n);

    // The host's canonical name of the encoding.
    std::string GetEncodingName();

    // Decode up to `n` units, or everything to the end of the data, and return the number of units
    // produced. `bytesConsumed` (may be null) receives the bytes that they took. Bytes that were
    // read and not needed after all (only ill-formed text leaves any) are given back by Rewind. A
    // converter that fails on more than 1 GiB at once throws ConversionSizeError.
    unsigned long GetNCodePoints(char16_t* out, unsigned long n, std::size_t* bytesConsumed);
    unsigned long GetNCodePoints(OutputBuffer& buffer, unsigned long n, std::size_t* bytesConsumed);
    // Returns only the units of the last round; the buffer's size tells the rest.
    unsigned long GetNCodePoints(OutputBuffer& buffer, std::size_t* bytesConsumed);
    unsigned long GetNCodePoints(std::u16string& text, unsigned long n, std::size_t* bytesConsumed);

    // Reads one word between breakable spaces, at most `width` units unless `noLimit`. The space
    // behind it stays unread. Returns the units stored.
    unsigned long GetString(OutputBuffer& buffer, long width, bool noLimit);

    // Reads past breakable spaces.
    void SkipWhiteSpace();

    // Makes the unit read last, which took so many bytes, the next one to be read: gives back the
    // bytes, or keeps the unit when it was not made of them alone, as in ill-formed text of some
    // encodings.
    void giveBack(char16_t unit, std::size_t bytes);

    // Forgets what was decoded and not read: for whoever moves the data without this stream.
    void forgetUnread();

    // Encodes and writes `n` units with one PutNElements. Returns `n` when every byte went out and
    // else 0; in an encoding of fixed size, the characters written. A high surrogate at the end is
    // held for the next call.
    unsigned long PutString(const char16_t* text, unsigned long n);
    unsigned long PutString(std::u16string_view text) {
        return PutString(text.data(), text.size());
    }

    // PutString of `n` ASCII bytes; a byte above 0x7F writes nothing and returns 0.
    int PutASCIIString(const char* text, int n);

    // Whether ASCII bytes that come next are decoded to themselves, without a converter.
    bool readsAsciiAsIs() const { return asciiSoFar || (asciiTransparent && !midCharacter); }

protected:
    // Derives latinFixed and utf16 from ICU's own name of the converter.
    void SetEncodingSpecificFlags();

    // Looks for the first byte that is no 7-bit ASCII, or is a NUL anywhere but at the end, and
    // returns its index, clearing the flag; else 0.
    unsigned long asciiCheck(const char* bytes, unsigned long count);

    // Records an ICU failure as one of the codes -37 to -42; success and warnings leave the code.
    void CheckStatus(UErrorCode status);

private:
    friend struct LayoutProbe;
    friend class detail::AsciiOutput;
    friend class detail::UnitsAhead;
    struct Undecoded;

    void openConverter(const std::string& name);
    void openDetected(const std::string& detected);
    // Whether the encoding, now decided, is UTF-16.
    bool writesUnits();
    unsigned long readUnits(char16_t* out, unsigned long n, std::size_t* bytesConsumed);
    Undecoded readUndecoded(unsigned long wanted);
    unsigned long decode(Undecoded& bytes, char16_t* out, unsigned long room);
    unsigned long convert(Undecoded& bytes, char16_t* out, unsigned long room, UConverter* from);
    bool readsInPieces() const;
    bool hasState() const;
    bool takeWord(OutputBuffer& buffer, long width, long& count);
    bool takeBlanks();
    unsigned long decodeInto(OutputBuffer& buffer, std::size_t& room, std::size_t& bytesConsumed);
    unsigned long convertDirectly(Undecoded& bytes, char16_t* out, unsigned long room);
    unsigned long encode(const char16_t* text, unsigned long n, UErrorCode& status);
    void encodeDirectly(const char16_t*& text, const char16_t* textEnd, std::size_t& used);
    const detail::ByteTable* tableOfConverter();

    UConverter* converter = nullptr;
    bool latinFixed = false;  // an encoding whose units are taken as they come
    bool utf16 = false;       // output bypasses the converter
    bool asciiSoFar;          // undecided, and only 7-bit ASCII so far
    std::string readBytes;
    std::u16string oneChar;
    std::string writeBytes;
    std::u16string asciiText;
    bool asciiTransparent = false;  // without state, and bytes of 7-bit ASCII stand for themselves
    bool midCharacter = false;      // one of the next two holds what was read
    bool converterHolds = false;
    std::optional<char16_t> unitGivenBack;
    bool begunMidCharacter = false;  // the last read of units
    detail::DirectForm directForm{};
    const detail::ByteTable* byteTable = nullptr;
};

}  // namespace Orvandeil::FileIO
