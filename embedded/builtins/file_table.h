#pragma once

#include "embedded/builtins/open_close.h"

#include <map>
#include <memory>
#include <optional>
#include <string>
#include <vector>

namespace Orvandeil::FileIO::embedded {

// The open files of a host, by the numbers that its users know them by. A file stays at its address
// until it is closed; those still open are closed with the table.
class FileTable {
public:
    // Numbers that are always there. They are opened when they are first asked for.
    static constexpr int standardInput = 0;
    static constexpr int console = 1;
    static constexpr int errorConsole = 2;

    FileTable() = default;
    FileTable(const FileTable&) = delete;
    FileTable& operator=(const FileTable&) = delete;
    ~FileTable();

    // openFile(); returns the smallest number that is free.
    int open(const std::string& name, const OpenRequest& request);
    // CodeError with EBADF for a number that is not open.
    OpenFile& file(int number);
    // Settles and closes; the number is free in any case. CodeError with EBADF, also for a standard
    // number that nobody has asked for yet.
    std::optional<Failure> close(int number);
    // Those opened by open(), in ascending order.
    std::vector<int> numbers() const;

private:
    int smallestFree() const;

    std::map<int, std::unique_ptr<OpenFile>> files;
};

}  // namespace Orvandeil::FileIO::embedded
