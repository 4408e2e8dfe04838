#include "tests/faults/scenarios.h"

#include "embedded/builtins/binary_read.h"
#include "embedded/builtins/binary_write.h"
#include "embedded/builtins/file_table.h"
#include "embedded/builtins/open_close.h"
#include "embedded/builtins/positioning.h"
#include "embedded/builtins/print.h"
#include "embedded/builtins/scan.h"
#include "embedded/builtins/text_lines.h"
#include "embedded/npy/npy_file.h"
#include "embedded/services/messages.h"
#include "fileio/errors/code_list.h"
#include "fileio/host/text.h"
#include "fileio/printf/escape_sequences.h"
#include "fileio/printf/printf_controller.h"
#include "fileio/text/output_string_stream.h"
#include "tests/support/arrays.h"

#include <algorithm>
#include <cmath>

namespace faults {
namespace {

using namespace Orvandeil::FileIO;
using namespace Orvandeil::FileIO::embedded;
using support::TempFile;

// Values that print in many ways, and stay from one run to the next.
const std::vector<const vxArray*>& argumentsOf(std::size_t set) {
    static const ArrayPtr numbers = makeDoubles(2, 3, {1, -2.5, 1e300, 4, double(NAN), 65});
    static const ArrayPtr field = makeDoubles(1, 3, {8, 3, 2.5});
    static const ArrayPtr text = makeChars(u"text \u00E4\u20AC");
    static const ArrayPtr string = makeString(u"string");
    static const ArrayPtr scalar = makeScalar(7);
    static const FunctionTable element = {
        {"double", [](auto) { return makeScalar(8.5); }},
        {"int64", [](auto) { return makeRow<std::int64_t>(vxINT64_CLASS, {8}); }},
        {"char", [](auto) { return makeChars(u"eight"); }}};
    static const ArrayPtr object =
        makeObject("number", {{"size",
                               [](auto) {
                                   return makeDoubles(1, 2, {1, 1});
                               }},
                              {"subsref", [](auto) { return makeObject("number", element); }}});
    static const std::vector<const vxArray*> sets[] = {
        {numbers.get()},
        {text.get(), string.get(), numbers.get()},
        {scalar.get(), scalar.get()},
        {object.get(), scalar.get()},
        {},
        {field.get()},
    };
    return sets[set];
}

std::string nameOf(std::u16string_view format) {
    return vxTextToNarrow(format.data(), std::min<std::size_t>(format.size(), 14));
}

struct PrintRow {
    const char16_t* format;
    std::size_t arguments;
};
constexpr PrintRow printRows[] = {
    {u"plain \u20AC text that takes several writes\n", 4},
    {u"%d %5.2f|", 0},
    {u"%s-%-9s;%c", 1},
    {u"%2$x %1$+.3e\n", 2},
    {u"%*.*f|", 5},
    {u"%bx %tu %o", 0},
    {u"%700d|%-400s", 0},
    {u"%s %d;", 3},
    {u"%-1210.1200e", 2},
};

void printTo(TcodnStream& stream, const PrintRow& row) {
    std::vector<const vxArray*> arguments = argumentsOf(row.arguments);
    printfController controller(row.format, &stream, arguments.data(),
                                static_cast<int>(arguments.size()));
    const bool complete = controller.doPrintf();
    if (complete || controller.getErrorCode() == code::NotEnoughArgs) return;
    throw CodeError(controller.getErrorCode(), "print");
}

void printToString(World& world, const char* encoding, const PrintRow& row) {
    outputStringStream stream(encoding);
    printTo(stream, row);
    long bytes = 0;
    stream.getPosition(bytes);
    const std::unique_ptr<void, void (*)(void*)> block(stream.transferBuffer(), vxMemoryFree);
    world.note({static_cast<const char*>(block.get()), static_cast<std::size_t>(bytes)});
}

void printToFile(World& world, OpenFile& file, const PrintRow& row) {
    std::vector<const vxArray*> arguments = argumentsOf(row.arguments);
    World::check(print(file, row.format, arguments));
    world.settle();
}

void addPrinting(std::vector<Scenario>& all) {
    for (const PrintRow& row : printRows) {
        const std::string name = "print " + nameOf(row.format) + " to ";
        const auto toFile = [row](const char* mode, const char* encoding) {
            return [=](World& world) { printToFile(world, world.file(mode, encoding, ""), row); };
        };
        const auto toConsole = [row](int number) {
            return [=](World& world) { printToFile(world, world.console(number), row); };
        };
        all.push_back({name + "file", toFile("w", "UTF-8")});
        all.push_back({name + "UTF-16LE file", toFile("W", "UTF-16LE")});
        all.push_back({name + "appended ISO-2022-JP file", toFile("a", "ISO-2022-JP")});
        all.push_back({name + "pipe", toFile("w|", "ISO-8859-1")});
        all.push_back({name + "string", [row](World& w) { printToString(w, "", row); }});
        all.push_back({name + "UTF-8 string", [row](World& w) { printToString(w, "UTF-8", row); }});
        all.push_back({name + "console", toConsole(FileTable::console)});
        all.push_back({name + "error console", toConsole(FileTable::errorConsole)});
    }
    all.push_back({"print by rows of a matrix", [](World& world) {
                       const vxArray* matrix = argumentsOf(0)[0];
                       printfMatrixArgumentSource source(&matrix);
                       source.setRow(1);
                       PrintFormatParser parser(u"%5.1f|", true);
                       foutFormatPiece* const piece = parser.getNextPrintFormatPiece();
                       TcodnStream& stream = *world.file("w", "UTF-8", "").stream;
                       while (source.hasMoreData()) {
                           try {
                               piece->printFormattedOutputToDestination(&stream, &source);
                           } catch (int code) {
                               throw CodeError(code, "matrix");
                           }
                       }
                       world.settle();
                   }});
}

void noteScan(World& world, const ScanResult& result) {
    world.note(support::shown(result.array));
    World::check(result.failure);
    world.note(std::to_string(result.count));
}

void addScanning(std::vector<Scenario>& all) {
    static constexpr std::string_view text =
        "12 -7 0x1F word 3.25e2 inf 99999999999999999999 nan tail,end \t 1e 5";
    static constexpr const char16_t* formats[] = {
        u"%d %d %i",          u"%f",  u"%s",   u"%4c", u"%[0-9 -]%[^,]",
        u"12 %*d %x word %f", u"%*s", u"%d %s"};
    for (const char16_t* format : formats) {
        const std::string name = "scan " + nameOf(format);
        const auto fromFile = [format](const char* mode, const char* encoding) {
            return [=](World& world) {
                noteScan(world, scan(world.file(mode, encoding, text), format, SizeAttribute()));
            };
        };
        all.push_back({name + " from file", fromFile("r", "UTF-8")});
        all.push_back({name + " from pipe", fromFile("r|", "UTF-8")});
        all.push_back({name + " from Shift_JIS update file", fromFile("r+", "Shift_JIS")});
        all.push_back({name + " from text", [format](World& world) {
                           const std::u16string units(text.begin(), text.end());
                           noteScan(world, scanText(units, "", format, SizeAttribute()));
                       }});
    }
}

struct TransferRow {
    const char* precision;
    const char* encoding;
    double skip;
};

void addBinaryReads(std::vector<Scenario>& all) {
    static constexpr TransferRow rows[] = {
        {"uint8", "UTF-8", 0},    {"*double", "UTF-8", 0}, {"int16=>single", "UTF-8", 0},
        {"3*int16=>int8", "", 5}, {"uint32", "", 20000},   {"bit3", "UTF-8", 0},
        {"2*ubit12", "UTF-8", 3}, {"char", "UTF-8", 0},    {"char", "UTF-16BE", 0},
        {"*logical", "UTF-8", 1}, {"uint8=>char", "", 0},  {"int32=>noconvert", "UTF-8", 0},
    };
    std::string content;
    for (int i = 0; i < 200; ++i)
        content += static_cast<char>(i % 96 + 32);
    for (const TransferRow& row : rows) {
        for (const char* mode : {"r", "r|", "a+"}) {
            all.push_back({std::string("read ") + row.precision + " of " + mode, [=](World& world) {
                               const MachineFormat format("b");
                               const ArrayPtr size = makeDoubles(1, 2, {3, 11});
                               const ArrayPtr skip = makeScalar(row.skip);
                               const ReadAttributes attributes(row.precision, format, size.get(),
                                                               skip.get());
                               OpenFile& file = world.file(mode, row.encoding, content);
                               if (mode[0] == 'a') rewind(file);
                               const ReadResult result = readBinary(file, attributes);
                               world.note(support::shown(result.array));
                               World::check(result.failure);
                           }});
        }
    }
}

void writeNumbers(World& world, OpenFile& file, const char* precision, double skip) {
    const ArrayPtr gap = makeScalar(skip);
    const vxArray& value = *argumentsOf(0)[0];
    const WriteAttributes attributes(value, precision, MachineFormat("b"), gap.get());
    World::check(writeBinary(file, value, attributes).failure);
    world.settle();
}

void addBinaryWrites(std::vector<Scenario>& all) {
    static constexpr TransferRow rows[] = {
        {"uint8", "UTF-8", 0}, {"double", "", 0},       {"2*int32", "UTF-8", 5}, {"bit7", "", 0},
        {"ubit3", "", 2},      {"char", "UTF-16LE", 0}, {"char", "UTF-8", 1},    {"single", "", 9},
    };
    for (const TransferRow& row : rows) {
        for (const char* mode : {"w", "r+", "a+", "W|"}) {
            // Behind the last byte there is none that bits could be merged with.
            if (mode[0] == 'a' &&
                std::string_view(row.precision).find("bit") != std::string_view::npos)
                continue;
            all.push_back(
                {std::string("write ") + row.precision + " to " + mode, [=](World& world) {
                     OpenFile& file = world.file(mode, row.encoding, std::string(90, 'o'));
                     const bool isPipe = std::string_view(mode).ends_with('|');
                     writeNumbers(world, file, row.precision, isPipe ? 0 : row.skip);
                 }});
        }
    }
    all.push_back({"write bits behind bits read", [](World& world) {
                       OpenFile& file = world.file("r+", "UTF-8", "0123456789");
                       const ArrayPtr size = makeScalar(3);
                       const ReadAttributes attributes("ubit4", file.format, size.get());
                       const ReadResult read = readBinary(file, attributes);
                       world.note(support::shown(read.array));
                       World::check(read.failure);
                       writeNumbers(world, file, "bit4", 0);
                   }});
}

void addFiles(std::vector<Scenario>& all) {
    for (const char* encoding : {"UTF-8", "UTF-16LE"}) {
        for (const char* mode : {"r", "r|"}) {
            all.push_back({std::string("lines of ") + encoding + ' ' + mode, [=](World& world) {
                               const std::string narrow = "one\ntwo\r\n\rlast, and long";
                               std::string text = narrow;
                               if (encoding[4] == '1') {
                                   text.clear();
                                   for (const char c : narrow)
                                       (text += c) += '\0';
                               }
                               OpenFile& file = world.file(mode, encoding, text);
                               while (const auto line = readLine(file, 9, Terminators::Kept)) {
                                   world.note(nameOf(line->text()) + '|');
                                   World::check(line->failure);
                               }
                           }});
        }
    }
    all.push_back({"move about", [](World& world) {
                       OpenFile& file = world.file("r+", "UTF-8", std::string(50, 'x'));
                       for (const auto origin : {Origin::End, Origin::Begin, Origin::Current}) {
                           seek(file, origin == Origin::End ? -7 : 9, origin);
                           world.note(std::to_string(tell(file)) + ' ');
                       }
                       world.note(std::to_string(endOfFile(file)));
                       rewind(file);
                       world.check(print(file, u"new", {}));
                       world.settle();
                   }});
    all.push_back(
        {"open, detect, read, close",
         [](World& world) {
             const TempFile content("caf\xE9 na\xEFve gar\xE7on, l'\xE9t\xE9 \xE0 la plage\n");
             FileTable table;
             const int number = table.open(content.path(), {});
             const auto line = readLine(table.file(number));
             world.note(table.file(number).stream->GetEncodingName());
             world.note(line ? vxTextToNarrow(line->text().data(), line->text().size()) : "none");
             World::check(table.close(number));
         },
         true});
    for (const char* permission : {"w", "a+t", "W"}) {
        all.push_back(
            {std::string("open, print, close ") + permission, [=](World& world) {
                 const TempFile content("old ");
                 {
                     FileTable table;
                     const int number = table.open(content.path(), {permission, "b", "UTF-8"});
                     World::check(print(table.file(number), u"%d\n", {}));
                     World::check(print(table.file(number), u"text", {}));
                     World::check(table.close(number));
                 }
                 world.note(content.content());
             }});
    }
    all.push_back({"open with an encoding that the host warns of", [](World& world) {
                       const WarningRecorder recorder;
                       const TempFile content("abc");
                       auto file = openFile(content.path(), {"r", "n", "UTF-7"});
                       world.note(file->stream->GetEncodingName());
                       World::check(closeFile(std::move(file)));
                   }});
}

void addArrays(std::vector<Scenario>& all) {
    for (const vxClassID classID : {vxINT8_CLASS, vxDOUBLE_CLASS, vxCHAR_CLASS, vxLOGICAL_CLASS}) {
        all.push_back({std::string("convert to ") + nameOfClass(classID), [=](World& world) {
                           OutputBuffer source(vxDOUBLE_CLASS, 4, 1, 8);
                           for (int i = -20; i < 20; ++i)
                               source.AppendScalar(i);
                           OutputBuffer target(classID, 1, 1, 1);
                           target.AppendBuffer(source);
                           world.note(support::shown(ArrayPtr(target.TransferArray())));
                       }});
    }
    for (const vxComplexity complexity : {vxREAL, vxCOMPLEX}) {
        const char* const name = complexity == vxREAL ? "real" : "complex";
        all.push_back({std::string("NumPy file, ") + name, [=](World& world) {
                           const TempFile file;
                           npyWrite(file.path(), *makeNumeric(vxSINGLE_CLASS, {3, 2}, complexity));
                           world.note(support::shown(copyOf(*npyRead(file.path()))));
                       }});
    }
    all.push_back({"attributes and escapes", [](World& world) {
                       const WarningRecorder recorder;
                       const MachineFormat format("b");
                       const ArrayPtr size = makeDoubles(1, 2, {2, double(INFINITY)});
                       const ReadAttributes attributes("4*int17=>uint16", format, size.get());
                       std::u16string text = u"a\\n\\x41\\0\\q";
                       builtins::util::convertFormatEscSeqs(text, false);
                       world.note(std::to_string(attributes.precision.repeatCount));
                       for (const std::string& warning : recorder.identifiers())
                           world.note(warning);
                       FilePermission permission("rw", false);
                       try {
                           permission.Validate();
                       } catch (const KESTRA::fopen::ConflictingExclusiveFileModes&) {
                           world.note("conflict");
                       } catch (const foundation::core::except::IMsgIDException& error) {
                           world.note(error.GetID());
                       }
                   }});
}

}  // namespace

OpenFile& World::file(std::string mode, const char* encoding, std::string_view content) {
    const bool isPipe = mode.back() == '|';
    if (isPipe) mode.pop_back();
    FilePermission permission(mode.c_str(), false);
    permission.Validate();
    {
        const Pause pause;
        initial = permission.write ? "" : content;
        disk = std::make_unique<Disk>(initial);
    }
    disk->seekable = !isPipe;
    openFile = std::make_unique<OpenFile>("disk", nullptr, permission, MachineFormat());
    openFile->handle.reset(disk->open(permission.fileSystemFormat));
    openFile->stream = std::make_unique<fileStream>(openFile->handle.get(), encoding,
                                                    openFile->permission, u"/dev/null");
    return *openFile;
}

OpenFile& World::console(int number) {
    isConsole = true;
    {
        const Pause pause;
        disk = std::make_unique<Disk>("");
        replacement = std::make_unique<ConsoleReplacement>(
            number == FileTable::console ? vxConsoleOutput() : vxConsoleError(), *disk);
    }
    openFile = number == FileTable::console ? openConsole() : openErrorConsole();
    return *openFile;
}

void World::note(std::string_view part) {
    const Pause pause;
    values += part;
}

void World::check(const std::optional<Failure>& failure) {
    if (failure) throw CodeError(*failure);
}

void World::settle() {
    check(flushFile(*openFile));
}

std::string World::nextCall() {
    const Pause pause;
    replacement.reset();
    if (!openFile || !openFile->stream || isConsole) return "";
    try {
        OpenFile& file = *openFile;
        clearError(file);
        if (disk->seekable) {
            rewind(file);
            const bool isEmpty = disk->bytes.empty();
            if (file.permission.read || file.permission.update) {
                const auto line = readLine(file);
                if (!line && !isEmpty) return "nothing is read";
                seek(file, 0, Origin::End);
            }
        }
        if (!file.permission.read || file.permission.update) {
            const std::string before = disk->bytes;
            check(print(file, u"next", {}));
            check(flushFile(file));
            if (disk->bytes == before) return "nothing is written";
        }
        check(closeFile(std::move(openFile)));
    } catch (const CodeError& error) {
        return error.what() + std::to_string(error.code);
    }
    return "";
}

std::vector<Scenario> everyScenario() {
    std::vector<Scenario> all;
    addPrinting(all);
    addScanning(all);
    addBinaryReads(all);
    addBinaryWrites(all);
    addFiles(all);
    addArrays(all);
    return all;
}

}  // namespace faults
