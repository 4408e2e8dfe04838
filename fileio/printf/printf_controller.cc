#include "fileio/printf/printf_controller.h"

#include "fileio/errors/code_list.h"

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

}  // namespace

printfController::printfController(std::u16string format, TcodnStream* out, const vxArray** args,
                                   int count)
    : parser(std::move(format), false), source(makeSource(parser, args, count)), output(out) {}

printfController::~printfController() = default;

bool printfController::doPrintf() {
    try {
        printAllPasses();
        return true;
    } catch (int failure) {
        errorCode = failure;
        return false;
    }
}

// A numbered format is not rewound, so its second pass finds no piece.
void printfController::printAllPasses() {
    while (takePiece()) {
        do {
            currentPiece->printFormattedOutputToDestination(output, source.get());
        } while (takePiece());
        if (!source->hasMoreData()) return;
        if (parser.getArgumentType() == PrintFormatParser::ArgumentsNone) {
            throw code::MatchingFailure;
        }
        parser.resetParser();
    }
}

bool printfController::takePiece() {
    foutFormatPiece* const piece = parser.getNextPrintFormatPiece();
    if (piece == nullptr) return false;
    currentPiece = piece;
    return true;
}

}  // namespace Orvandeil::FileIO
