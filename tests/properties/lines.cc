#include "tests/properties/properties.h"
#include "tests/support/test_files.h"
#include "tests/text/memory_stream.h"

#include <algorithm>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;

// Every line as its text and its result, then "$" as soon as the end of the file shows.
std::string linesOf(fileStream& stream, long max, std::size_t roomAhead) {
    std::string summary;
    for (std::size_t chunk = 4;; chunk = 404 - chunk) {
        char16_t ahead[40];
        OutputBuffer line(vxCHAR_CLASS, 16, chunk, 64);
        int result = -1;
        if (const std::size_t units = stream.takeLineAhead(ahead, roomAhead, result)) {
            line.AppendData(vxCHAR_CLASS, ahead, units);
        } else {
            result = stream.GetLine(max, line);
        }
        const std::size_t units = line.GetSize();
        if (units == 0) return summary + " code " + std::to_string(stream.getErrorCode());
        const auto text = line.Transfer();
        summary += bytesOf({static_cast<const char16_t*>(text.get()), units});
        summary += '(' + std::to_string(result) + (stream.EndOfData() ? ")$" : ")");
    }
}

// The same of a text. At the maximum not even the second half of a pair is taken.
std::string modelOf(std::u16string_view text, long max) {
    std::string summary;
    while (!text.empty() && (max > 0 || max == -1)) {
        const auto limit = static_cast<std::size_t>(max);
        const std::u16string_view most = text.substr(0, limit);
        const std::size_t body = std::min(most.find_first_of(u"\r\n"), most.size());
        const bool isPair = body + 1 < limit && text.substr(body, 2) == u"\r\n";
        const std::size_t result = isPair ? 2 : body < std::min(limit, text.size()) ? 1 : 0;
        const std::size_t length = body + result;
        summary += bytesOf(text.substr(0, length)) + '(' + std::to_string(result) + ')';
        text.remove_prefix(length);
        if (text.empty()) summary += '$';
    }
    return summary + " code 0";
}

}  // namespace

// Lines are what the whole text, decoded, splits into.
void lines(Bytes& input) {
    static const std::u16string parts[] = {u"a",    u"\n",   u"\r",   u"\r\n", u"\u3042", u"é",
                                           u"\x1A", u"xyz ", u"\n\n", u"\x85", u"\u2028", u"\0"};
    const char* const encoding = input.of(statelessEncodings);
    const long max = input.below(2) == 0 ? -1 : static_cast<long>(input.below(14)) - 2;
    const std::size_t roomAhead = max == -1 ? input.below(41) : 0;
    const std::size_t bufferSize = 1 + input.below(40);
    const bool canSeek = input.below(2) == 0;
    MemoryStream encoder(encoding);
    const std::string runs[] = {"a", "b"};
    for (std::size_t count = input.below(40); count > 0; --count)
        encoder.PutString(input.of(parts));
    encoder.PutString(std::u16string(input.below(8) == 0 ? input.below(9000) : 0, u'z'));
    const std::string bytes = encoder.output + input.text(runs, 20);
    MemoryStream decoder(encoding, bytes);
    std::u16string text;
    decoder.GetNCodePoints(text, bytes.size(), nullptr);
    support::FaultyFile memory{.bytes = bytes, .failingSeek = canSeek ? 0 : 1, .error = ESPIPE};
    support::OpenedFile opened(memory.open("r", bufferSize), "r", encoding);
    const std::string seen = linesOf(opened.stream, max, roomAhead);
    requireEqual(seen, modelOf(text, max),
                 encoding + (" at most " + std::to_string(max)) + " of " + bytes);
    input.observe(seen);
}

}  // namespace properties
