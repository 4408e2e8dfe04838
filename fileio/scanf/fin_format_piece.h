#pragma once

#include "fileio/buffers/output_buffer.h"
#include "fileio/export.h"
#include "fileio/host/arrays.h"
#include "fileio/memory_operation_overloads.h"
#include "fileio/piece_list.h"
#include "fileio/scanf/vocabulary.h"
#include "fileio/text/tcodn_stream.h"

#include <cstddef>
#include <memory>
#include <string>
#include <string_view>

namespace Orvandeil::FileIO {

// What the parser found out about one piece.
struct finFormatPieceInitBlock {
    std::u16string_view text;
    int width = -1;  // -1: none
    bool suppress = false;
};

// One piece of an input format: a literal run, a conversion, or the error that ends the format.
class FILEIO_API finFormatPiece : public fiMemoryOperationOverloads {
public:
    // Copies the text. One of more than 2147483647 characters raises
    // "KESTRA:legacy_two_part:p64bitsize".
    explicit finFormatPiece(const finFormatPieceInitBlock& init);
    finFormatPiece& operator=(const finFormatPiece&) = delete;
    virtual ~finFormatPiece();

    virtual std::unique_ptr<finFormatPiece> clone() const = 0;
    virtual bool isLiteral() const { return false; }
    // The class of the values that the piece produces.
    virtual vxClassID getClassID() const = 0;

    // Reads from `input` and appends to `result`, converted to its class. Returns the values that
    // count: 1, and 0 for a literal or a suppressed conversion. A failure sets `failed`, tells its
    // reason in `status` and returns 0: 0 at the end of the data, -9 for input that does not
    // match, else a code of the stream or of the format. `hostFlag` is passed on from the driver,
    // and no piece looks at it.
    virtual unsigned long scan(TcodnStream& input, OutputBuffer& result, bool hostFlag,
                               bool& failed, int& status) = 0;

    virtual FORMAT getFormat() const = 0;

    // The piece's part of the format, without the "*" of a suppressed conversion; NUL-terminated.
    std::u16string_view getText() const { return {text, textLength - 1}; }
    // The same in ASCII; null when it holds anything else. Made when it is first asked for.
    const char* getAsciiText();
    // The width as parsed: -1 for none, 0 for a literal.
    int getWidth() const { return savedWidth; }
    bool isSuppressed() const { return suppress; }

    // Undoes what a scan used up of the width.
    void restoreWidth() { width = savedWidth; }

protected:
    // For clone().
    finFormatPiece(const finFormatPiece& other);

    static unsigned long fail(int reason, bool& failed, int& status);

private:
    friend struct LayoutProbe;

    struct FreeText {
        void operator()(void* block) const noexcept { vxMemoryFree(block); }
    };
    template <class Unit>
    using HostText = std::unique_ptr<Unit[], FreeText>;

    template <class Unit>
    static HostText<Unit> copyText(const Unit* source, std::size_t count);
    void keepText(std::u16string_view source);

protected:
    int width;

private:
    int savedWidth;
    const char16_t* text;
    HostText<char> asciiText;
    std::size_t textLength;  // its terminator included

protected:
    bool suppress;
    std::u16string oneChar;

private:
    // Where the text is.
    HostText<char16_t> longText;
    char16_t shortText[12];
};

using finFormatPieceList = detail::PieceList<finFormatPiece, 1024>;

}  // namespace Orvandeil::FileIO
