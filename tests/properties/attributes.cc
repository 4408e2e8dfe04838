#include "embedded/services/messages.h"
#include "fileio/attributes/file_permission.h"
#include "fileio/attributes/machine_format.h"
#include "fileio/attributes/precision_string.h"
#include "tests/properties/properties.h"
#include "tests/support/raised.h"

#include <cctype>
#include <cstring>
#include <string>

namespace properties {
namespace {

using namespace Orvandeil::FileIO;
using fileio_tests::raisedBy;

std::string describe(const PrecisionString& p) {
    std::string text;
    for (const long number :
         {static_cast<long>(p.inputType), static_cast<long>(p.outputType),
          static_cast<long>(p.repeatCount), static_cast<long>(p.bitCount),
          static_cast<long>(p.convertedSize), static_cast<long>(p.machineFormat)})
        text += std::to_string(number) + ' ';
    return text;
}

// The text that says what a precision holds, in full unless it has to be the short form.
std::string spelt(const PrecisionString& p, bool isShort) {
    static const std::string names[] = {"",       "logical", "char",   "int8",     "int16",
                                        "int32",  "int64",   "uint8",  "uint16",   "uint32",
                                        "uint64", "single",  "double", "noconvert"};
    const auto name = [&](int type) { return names[static_cast<std::size_t>(type)]; };
    std::string source = name(p.inputType);
    if (p.bitCount != 0) {
        source = (source[0] == 'u' ? "ubit" : "bit") + std::to_string(p.bitCount);
        if (p.convertedSize != 0) source += "in" + std::to_string(p.convertedSize);
    }
    if (isShort) return '*' + source;
    return std::to_string(p.repeatCount) + '*' + source + "=>" + name(p.outputType);
}

void precision(Bytes& input) {
    static const std::string parts[] = {
        "uint8", "int16",  "double",    "=>", "*",    "bit",    "ubit",
        "in",    "64",     "noconvert", " ",  "char", "int",    "uint",
        "40*",   "real*8", "unsigned ", "65", "long", "uint64", "0"};
    const int format = static_cast<int>(input.below(7));
    const std::string text = input.text(parts, 6);
    PrecisionString parsed;
    parsed.machineFormat = format;
    embedded::WarningRecorder recorder;
    parsed = text.c_str();
    const std::string raised = raisedBy([&] { parsed.Validate(); });
    requireEqual(raised, parsed.valid ? "" : "KESTRA:legacy_two_part:badprecision_vx", text);
    input.observe(raised + describe(parsed));
    // A target with more behind it is passed over, but may have moved the format.
    const std::size_t target = text.find("=>");
    if (!parsed.valid || (target != text.npos && text.find('=', target + 2) != text.npos)) return;
    PrecisionString again;
    again.machineFormat = format;
    const std::string full = spelt(parsed, text[0] == '*');
    again = full.c_str();
    requireEqual(describe(again), describe(parsed), text + " again as " + full);
}

void permission(Bytes& input) {
    static const std::string parts[] = {"r", "w", "a", "W", "A", "+", "b", "t"};
    const std::string text = input.text(parts, 6).c_str();
    const auto has = [&](const char* letters) { return text.find_first_of(letters) != text.npos; };
    const int groups = has("r") + has("wW") + has("aA");
    std::string wanted;
    if (text.empty() || !std::strchr("rwaWA", text[0]))
        wanted = "KESTRA:legacy_two_part:badpermission_vx";
    else if (text.find_first_not_of("rwab+AWt") != text.npos)
        wanted = "KESTRA:fopen:IncorrectFileMode";
    else if (groups != 1)
        wanted = "KESTRA:fopen:ConflictingExclusiveFileModes";
    const FilePermission parsed(text.c_str(), false);
    requireEqual(raisedBy([&] { parsed.Validate(); }), wanted, text);
    if (!wanted.empty()) return;
    std::string mode(1, static_cast<char>(std::tolower(text[0])));
    mode += has("+") ? "+b" : "b";
    requireEqual(parsed.fileSystemFormat, mode, text);
    std::string kept = text;
    if (has("t")) kept.erase(text.find('t'), 1);
    requireEqual(parsed.text, kept, text);
    requireEqual(std::to_string(parsed.autoFlush), std::to_string(!has("WA")), text);
}

void machineFormat(Bytes& input) {
    static const std::string parts[] = {"n",          "native", "L", "b", "little-endian",
                                        "BIG-endian", ".l64",   " "};
    const std::string text = input.text(parts, 2).c_str();
    std::string lower;
    for (const char letter : text)
        lower += static_cast<char>(std::tolower(static_cast<unsigned char>(letter)));
    const char* const names[][3] = {{"0", "n", "native"},
                                    {"0", "l", "little-endian"},
                                    {"1", "b", "big-endian"},
                                    {"5", "a", "little-endian.l64"},
                                    {"6", "s", "big-endian.l64"}};
    std::string wanted = text == " " ? "0 invalid" : "7 invalid";
    for (const auto& row : names) {
        if (lower == row[1] || lower == row[2]) wanted = row[0];
    }
    const MachineFormat parsed(text.c_str());
    requireEqual(std::to_string(parsed.dataSizeType) + (parsed.valid ? "" : " invalid"), wanted,
                 text);
}

}  // namespace

void attributes(Bytes& input) {
    constexpr void (*subjects[])(Bytes&) = {precision, precision, permission, machineFormat,
                                            permission};
    input.of(subjects)(input);
}

}  // namespace properties
