#include "fileio/printf/printf_controller.h"

#include "fileio/errors/code_list.h"
#include "fileio/printf/element_program.h"
#include "fileio/printf/word_program.h"

#include <optional>

namespace Orvandeil::FileIO {
namespace {

std::unique_ptr<printfArgumentSource> makeSource(const PrintFormatParser& parser,
                                                 const vxArray** args, int count) {
    const auto argc = static_cast<std::size_t>(count);
    if (parser.getArgumentType() == PrintFormatParser::ArgumentsNumbered) {
        return std::make_unique<printfNumberedArgumentSource>(args, argc);
    }
    return std::make_unique<printfSequentialArgumentSource>(args, argc);
}

#ifdef FILEIO_FAST_PATHS
// Preparing a program costs about as much as printing so many elements or words without it.
constexpr std::size_t worthPreparing = 8;
#endif

}  // namespace

printfController::printfController(std::u16string format, TcodnStream* out, const vxArray** args,
                                   int count)
    : parser(std::move(format), false), source(makeSource(parser, args, count)), output(out) {}

printfController::~printfController() = default;

bool printfController::doPrintf() {
    try {
        printAllPasses();
    } catch (int failure) {
        errorCode = failure;
    }
    return complete;
}

void printfController::printAllPasses() {
    if (printPass()) printFurtherPasses();
}

#ifdef FILEIO_FAST_PATHS
// Not part of its caller, which would set up the program's block for a single pass too.
[[gnu::noinline]] void printfController::printFurtherPasses() {
    const bool sequential = parser.getArgumentType() == PrintFormatParser::ArgumentsSequential;
    std::optional<detail::ElementProgram> elements;
    std::optional<detail::WordProgram> words;
    do {
        if (!sequential) continue;
        if (source->wholeArguments().size() >= worthPreparing) {
            if (!words) words.emplace(parser.getPieces(), *output);
            if (words->isUsable()) words->run(*source, currentPiece);
        }
        if (source->plainElements().count >= worthPreparing) {
            if (!elements) elements.emplace(parser.getPieces(), *output);
            if (elements->isUsable()) elements->run(*source, currentPiece);
        }
    } while (printPass());
}
#else
void printfController::printFurtherPasses() {
    while (printPass()) {
    }
}
#endif

// Whether another pass follows. A numbered format is not rewound, so its second pass finds no
// piece.
bool printfController::printPass() {
    complete = !takePiece();
    if (complete) return false;
    do {
        if (isOutOfData()) {
            errorCode = code::NotEnoughArgs;
            return false;
        }
        currentPiece->printFormattedOutputToDestination(output, source.get());
    } while (takePiece());
    complete = !source->hasMoreData();
    if (complete) return false;
    if (parser.getArgumentType() == PrintFormatParser::ArgumentsNone) throw code::MatchingFailure;
    parser.resetParser();
    return true;
}

// What the piece would throw: data that end within the format are too ordinary for that.
bool printfController::isOutOfData() const {
    return parser.getArgumentType() == PrintFormatParser::ArgumentsSequential &&
           currentPiece->consumesData() && !source->hasCurrentArg();
}

bool printfController::takePiece() {
    foutFormatPiece* const piece = parser.getNextPrintFormatPiece();
    if (piece == nullptr) return false;
    currentPiece = piece;
    return true;
}

}  // namespace Orvandeil::FileIO
