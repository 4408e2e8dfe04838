#include "embedded/builtins/spool.h"

#include "embedded/builtins/progress_line.h"
#include "fileio/constants.h"

#include <cerrno>
#include <vector>

namespace Orvandeil::FileIO::embedded {

FileHandle spool(std::FILE* source, const std::string& label) {
    errno = 0;
    FileHandle copy(std::tmpfile());
    if (!copy) throw CodeError(errno, "temporary file for " + label);
    const ProgressLine progress(fileno(copy.get()), "reading " + label);
    std::vector<char> piece(constants::transferPieceBytes);
    std::size_t count = 0;
    do {
        errno = 0;
        count = std::fread(piece.data(), 1, piece.size(), source);
        if (std::ferror(source) != 0) throw CodeError(errno, label);
        if (std::fwrite(piece.data(), 1, count, copy.get()) != count) {
            throw CodeError(errno, "temporary file for " + label);
        }
    } while (count == piece.size());
    if (fseeko(copy.get(), 0, SEEK_SET) != 0) {
        throw CodeError(errno, "temporary file for " + label);
    }
    return copy;
}

}  // namespace Orvandeil::FileIO::embedded
