#include "fileio/printf/printf_controller.h"

#include "fileio/errors/code_list.h"
#include "fileio/printf/collected_text.h"
#include "fileio/printf/element_program.h"
#include "fileio/printf/word_program.h"

#include <optional>

namespace Orvandeil::FileIO {

#ifdef FILEIO_FAST_PATHS
namespace {

// Preparing a program costs about as much as printing so many elements or words without it.
constexpr std::size_t worthPreparing = 8;

}  // namespace
#endif

printfController::printfController(std::u16string format, TcodnStream* out, const vxArray** args,
                                   int count)
    : parser(std::move(format), false), output(out) {
    source = makeSource(args, static_cast<std::size_t>(count));
}

printfController::~printfController() = default;

printfArgumentSource* printfController::makeSource(const vxArray** args, std::size_t count) {
    if (parser.getArgumentType() == PrintFormatParser::ArgumentsNumbered)
        return &ownSource.emplace<printfNumberedArgumentSource>(args, count);
    return &ownSource.emplace<printfSequentialArgumentSource>(args, count);
}

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
#ifdef FILEIO_FAST_PATHS
    if (printCollected()) return endPass();
#endif
    complete = !takePiece();
    if (complete) return false;
    do {
        if (isOutOfData()) {
            errorCode = code::NotEnoughArgs;
            return false;
        }
        currentPiece->printFormattedOutputToDestination(output, source);
    } while (takePiece());
    return endPass();
}

bool printfController::endPass() {
    complete = !source->hasMoreData();
    if (complete) return false;
    if (parser.getArgumentType() == PrintFormatParser::ArgumentsNone) throw code::MatchingFailure;
    settleCurrentPiece();
    parser.resetParser();
    return true;
}

#ifdef FILEIO_FAST_PATHS
// Prints the first pieces of a pass; true when these were all of them, without an error behind.
bool printfController::printCollected() {
    const auto blocks = parser.getInitBlocks();
    if (blocks.empty() || !detail::CollectedText::suits(blocks)) return false;
    detail::CollectedText text(*output);
    if (!text.isUsable()) return false;
    isCurrentUnmade = true;
    for (std::size_t i = 0; i < blocks.size(); ++i) {
        parser.goOnWith(i + 1);
        if (text.take(blocks[i], *source)) continue;
        parser.goOnWith(i);
        return false;
    }
    return parser.getRecordedError() == 0;
}
#endif

// The pieces are made only when there is somebody to look at them.
void printfController::settleCurrentPiece() const {
    if (!isCurrentUnmade || parser.getNextIndex() == 0) return;
    currentPiece = parser.getPieces()[parser.getNextIndex() - 1];
    isCurrentUnmade = false;
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
    isCurrentUnmade = false;
    return true;
}

}  // namespace Orvandeil::FileIO
