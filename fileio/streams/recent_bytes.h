#pragma once

#include <cstdio>

namespace Orvandeil::FileIO::detail {

// The last few bytes read from a file, to be pushed back where the file cannot seek. They are
// enough for any one character.
class RecentBytes {
public:
    void add(int byte) {
        bytes = bytes << 8 | static_cast<unsigned char>(byte);
        if (count != capacity) ++count;
    }
    void add(const char* read, unsigned long size) {
        if (size >= capacity) {
            addAll(read + (size - capacity));
            return;
        }
        for (unsigned long i = 0; i < size; ++i)
            add(read[i]);
    }
    void clear() { count = 0; }
    // Forgets the newest byte.
    void drop() {
        bytes >>= 8;
        if (count != 0) --count;
    }

    // False, and nothing happens, when fewer than `size` are known.
    bool pushBack(std::FILE* file, unsigned long size) {
        if (size > count) return false;
        while (size-- != 0) {
            if (std::ungetc(static_cast<unsigned char>(bytes), file) == EOF) return false;
            drop();
        }
        return true;
    }

private:
    static constexpr unsigned long capacity = sizeof(unsigned long);

    void addAll(const char* read) {
        unsigned long newest = 0;
        for (unsigned long i = 0; i < capacity; ++i)
            newest = newest << 8 | static_cast<unsigned char>(read[i]);
        bytes = newest;
        count = capacity;
    }

    unsigned long bytes = 0;  // the newest lowest
    unsigned long count = 0;
};

}  // namespace Orvandeil::FileIO::detail
