#include "embedded/builtins/file_table.h"

#include <cerrno>
#include <utility>

namespace Orvandeil::FileIO::embedded {
namespace {

constexpr int firstNumber = FileTable::errorConsole + 1;

CodeError notOpen(int number) {
    return {EBADF, "file " + std::to_string(number)};
}

std::unique_ptr<OpenFile> openStandard(int number) {
    switch (number) {
        case FileTable::standardInput:
            return openStandardInput();
        case FileTable::console:
            return openConsole();
        case FileTable::errorConsole:
            return openErrorConsole();
        default:
            throw notOpen(number);
    }
}

}  // namespace

FileTable::~FileTable() {
    for (auto& [number, file] : files)
        closeFile(std::move(file));
}

int FileTable::smallestFree() const {
    int number = firstNumber;
    while (files.count(number) != 0)
        ++number;
    return number;
}

int FileTable::open(const std::string& name, const OpenRequest& request) {
    const int number = smallestFree();
    files.emplace(number, openFile(name, request));
    return number;
}

OpenFile& FileTable::file(int number) {
    const auto found = files.find(number);
    if (found != files.end()) return *found->second;
    return *files.emplace(number, openStandard(number)).first->second;
}

std::optional<Failure> FileTable::close(int number) {
    auto taken = files.extract(number);
    if (taken.empty()) throw notOpen(number);
    return closeFile(std::move(taken.mapped()));
}

std::vector<int> FileTable::numbers() const {
    std::vector<int> open;
    for (auto from = files.lower_bound(firstNumber); from != files.end(); ++from)
        open.push_back(from->first);
    return open;
}

}  // namespace Orvandeil::FileIO::embedded
