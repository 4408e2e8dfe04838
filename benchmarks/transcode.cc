#include "benchmarks/charsets.h"
#include "benchmarks/context.h"
#include "benchmarks/host_values.h"
#include "benchmarks/transcode_limits.h"
#include "fileio/buffers/host_block.h"
#include "fileio/text/input_string_stream.h"
#include "fileio/text/output_string_stream.h"

#include <iconv.h>
#include <memory>
#include <stdexcept>

namespace bench {
namespace {

using Orvandeil::FileIO::inputStringStream;
using Orvandeil::FileIO::outputStringStream;

struct TranscodeInput {
    Charset charset;
    std::u16string text;
    std::string bytes;
    // Blocks that hold either result. All contenders write there.
    std::unique_ptr<char16_t[]> units;
    std::unique_ptr<char[]> encodedBytes;
    std::size_t room;
};
using Input = std::shared_ptr<const TranscodeInput>;

Input makeInput(const Charset& charset, Context& context) {
    // About 50 MB of bytes, at most three a unit.
    const std::size_t units = context.scaled(25000000);
    auto input = std::make_shared<TranscodeInput>();
    input->charset = charset;
    input->text = textFor(charset, units);
    input->bytes = encoded(charset, input->text);
    input->room = 3 * units;
    input->units.reset(new char16_t[units + 16]());  // the limit stores in sixteens
    input->encodedBytes.reset(new char[input->room]());
    return input;
}

template <class Decode>
void decodeBy(Trial& trial, const TranscodeInput& input, Decode decode) {
    const std::size_t count = trial.time([&] {
        const std::size_t units = decode(input.units.get());
        keep(input.units.get());
        return units;
    });
    trial.result(std::u16string_view(input.units.get(), count));
}

template <class Encode>
void encodeBy(Trial& trial, const TranscodeInput& input, Encode encode) {
    const std::size_t count = trial.time([&] {
        const std::size_t bytes = encode(input.encodedBytes.get());
        keep(input.encodedBytes.get());
        return bytes;
    });
    trial.result(std::string_view(input.encodedBytes.get(), count));
}

class Iconv {
public:
    Iconv(const char* to, const char* from) : converter(iconv_open(to, from)) {
        if (converter == reinterpret_cast<iconv_t>(-1)) throw std::runtime_error("no iconv");
    }
    ~Iconv() { iconv_close(converter); }
    Iconv(const Iconv&) = delete;
    Iconv& operator=(const Iconv&) = delete;

    std::size_t convert(const void* from, std::size_t bytes, void* to, std::size_t room) const {
        char* in = static_cast<char*>(const_cast<void*>(from));
        char* out = static_cast<char*>(to);
        iconv(converter, &in, &bytes, &out, &room);
        return static_cast<std::size_t>(out - static_cast<char*>(to));
    }

private:
    iconv_t converter;
};

std::size_t oursDecodes(const TranscodeInput& input, char16_t* out) {
    inputStringStream stream(input.bytes.c_str(), static_cast<long>(input.bytes.size()),
                             input.charset.icuName);
    return stream.GetNCodePoints(out, input.text.size(), nullptr);
}

std::size_t iconvDecodes(const TranscodeInput& input, char16_t* out) {
    const Iconv converter("UTF-16LE", input.charset.iconvName);
    return converter.convert(input.bytes.data(), input.bytes.size(), out,
                             input.text.size() * sizeof(char16_t)) /
           sizeof(char16_t);
}

Job makeDecodeJob(const Charset& charset, Context& context) {
    const Input input = makeInput(charset, context);
    const auto icuDecodes = [input](char16_t* out) {
        return IcuConverter(input->charset.icuName).decode(input->bytes, out, input->text.size());
    };
    std::vector<Contender> contenders = {
        {ours,
         [=](Trial& trial) {
             decodeBy(trial, *input, [&](char16_t* out) { return oursDecodes(*input, out); });
         }},
        {"icu", [=](Trial& trial) { decodeBy(trial, *input, icuDecodes); }},
        {"iconv",
         [=](Trial& trial) {
             decodeBy(trial, *input, [&](char16_t* out) { return iconvDecodes(*input, out); });
         }},
        {limit,
         [=](Trial& trial) {
             decodeBy(trial, *input, [&](char16_t* out) {
                 return limitDecode(input->charset.icuName, input->bytes, out);
             });
         }},
    };
    return perByte(input->bytes.size(), std::move(contenders));
}

// Into a new block that is large enough, in pieces of 64 KB of text.
void oursEncodes(Trial& trial, const TranscodeInput& input) {
    long bytes = 0;
    const Orvandeil::FileIO::detail::HostBytes block = trial.time([&] {
        constexpr std::size_t pieceUnits = 32768;
        outputStringStream stream(input.charset.icuName);
        stream.EnsureSpace(input.room);
        for (std::size_t at = 0; at < input.text.size(); at += pieceUnits)
            stream.PutString(std::u16string_view(input.text).substr(at, pieceUnits));
        stream.getPosition(bytes);
        return Orvandeil::FileIO::detail::HostBytes(static_cast<char*>(stream.transferBuffer()));
    });
    trial.result(std::string_view(block.get(), static_cast<std::size_t>(bytes)));
}

// The same block new for each run as ours has.
template <class Encode>
void encodeIntoNewBlock(Trial& trial, const TranscodeInput& input, Encode encode) {
    std::size_t count = 0;
    const auto block = trial.time([&] {
        std::unique_ptr<char[]> fresh(new char[input.room]);
        count = encode(fresh.get());
        keep(fresh.get());
        return fresh;
    });
    trial.result(std::string_view(block.get(), count));
}

Job makeEncodeJob(const Charset& charset, Context& context) {
    const Input input = makeInput(charset, context);
    const auto icuEncodes = [input](char* out) {
        return IcuConverter(input->charset.icuName).encode(input->text, out, input->room);
    };
    const auto iconvEncodes = [input](char* out) {
        return Iconv(input->charset.iconvName, "UTF-16LE")
            .convert(input->text.data(), input->text.size() * sizeof(char16_t), out, input->room);
    };
    const auto loopEncodes = [input](char* out) {
        return limitEncode(input->charset.icuName, input->text, out);
    };
    std::vector<Contender> contenders = {
        {ours, [=](Trial& trial) { oursEncodes(trial, *input); }},
        {"icu", [=](Trial& trial) { encodeIntoNewBlock(trial, *input, icuEncodes); }},
        {"iconv", [=](Trial& trial) { encodeIntoNewBlock(trial, *input, iconvEncodes); }},
        {limit, [=](Trial& trial) { encodeBy(trial, *input, loopEncodes); }},
    };
    return perByte(input->bytes.size(), std::move(contenders));
}

}  // namespace

void addTranscodeJobs(JobList& jobs) {
    for (const Charset& charset : charsets) {
        jobs.push_back({std::string("decode-") + charset.name,
                        [charset](Context& context) { return makeDecodeJob(charset, context); }});
    }
    for (const Charset& charset : charsets) {
        jobs.push_back({std::string("encode-") + charset.name,
                        [charset](Context& context) { return makeEncodeJob(charset, context); }});
    }
}

}  // namespace bench
