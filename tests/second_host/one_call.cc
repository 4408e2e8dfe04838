#include "fileio/errors/fi_error.h"

int main() {
    return Orvandeil::FileIO::fiPkStrerror(0).empty() ? 0 : 1;
}
