#pragma once

#include "fileio/scanf/fin_format_piece.h"
#include "fileio/scanf/reading_functors.h"

#include <cerrno>
#include <climits>
#include <type_traits>

namespace Orvandeil::FileIO {

// A numeric conversion. It fails exactly when the stream wrote a status; scanFloat writes the mark
// of an untouched one after a number.
template <class ReadingFunctor, int valueClass>
class FILEIO_API finFormatPieceT : public finFormatPiece {
public:
    using finFormatPiece::finFormatPiece;

    std::unique_ptr<finFormatPiece> clone() const override {
        return std::unique_ptr<finFormatPiece>(new finFormatPieceT(*this));
    }
    vxClassID getClassID() const override { return static_cast<vxClassID>(valueClass); }
    FORMAT getFormat() const override { return ReadingFunctor::format; }

    unsigned long scan(TcodnStream& input, OutputBuffer& result, bool /*hostFlag*/, bool& failed,
                       int& status) override {
        constexpr int untouched = INT_MAX;
        errno = 0;
        int scanStatus = untouched;
        value = ReadingFunctor()(input, width, scanStatus);
        if (scanStatus != untouched) return fail(scanStatus, failed, status);
        if (suppress) return 0;
        append(result);
        return 1;
    }

private:
    friend struct LayoutProbe;
    using Value = typename ReadingFunctor::Value;

    void append(OutputBuffer& result) const {
        if constexpr (std::is_same_v<Value, double>) {
            result.AppendData(vxDOUBLE_CLASS, &value, 1);
        } else if constexpr (std::is_same_v<Value, float>) {
            result.AppendData(vxSINGLE_CLASS, &value, 1);
        } else {
            result.AppendScalar(value);
        }
    }

    Value value{};
};

}  // namespace Orvandeil::FileIO
