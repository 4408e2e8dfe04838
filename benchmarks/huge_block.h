#pragma once

#include <cstddef>

namespace bench {

// A new block of memory, in huge pages where the system has them.
class HugeBlock {
public:
    explicit HugeBlock(std::size_t size);
    ~HugeBlock();
    HugeBlock(const HugeBlock&) = delete;
    HugeBlock& operator=(const HugeBlock&) = delete;

    template <class T>
    T* as() const {
        return static_cast<T*>(memory);
    }

private:
    std::size_t bytes;
    void* memory;
};

}  // namespace bench
