#ifndef AVPOST_TESTS_DOUBLES_GUARDEDBUFFER_H
#define AVPOST_TESTS_DOUBLES_GUARDEDBUFFER_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <random>
#include <vector>

// Bytes a kernel works on, placed `offset` bytes past a 64-byte boundary and fenced by guard
// bytes on both sides, so that identity tests see every alignment and any write outside.
class GuardedBuffer {
public:
    explicit GuardedBuffer(size_t size, size_t offset = 0)
        : offset_(kGuard + offset), size_(size), storage_(kAlign + offset_ + size + kGuard, kMark)
    {
    }

    unsigned char* data() { return Start() + offset_; }
    const unsigned char* data() const { return Start() + offset_; }
    size_t size() const { return size_; }

    void Randomise(unsigned seed)
    {
        std::mt19937 random(seed);
        std::generate(data(), data() + size_, [&] { return static_cast<unsigned char>(random()); });
    }
    void Fill(unsigned char value) { std::fill(data(), data() + size_, value); }
    std::vector<unsigned char> Contents() const { return {data(), data() + size_}; }
    bool GuardsIntact() const
    {
        const unsigned char* start = Start();
        auto marked = [](const unsigned char* from, const unsigned char* to) {
            return std::all_of(from, to, [](unsigned char b) { return b == kMark; });
        };
        return marked(start + offset_ - kGuard, start + offset_) &&
               marked(start + offset_ + size_, start + offset_ + size_ + kGuard);
    }

private:
    static constexpr size_t kAlign = 64;
    static constexpr size_t kGuard = 64;
    static constexpr unsigned char kMark = 0xA5;

    // The first 64-byte boundary inside the storage.
    const unsigned char* Start() const
    {
        const auto address = reinterpret_cast<std::uintptr_t>(storage_.data());
        return storage_.data() + (kAlign - address % kAlign) % kAlign;
    }
    unsigned char* Start() { return const_cast<unsigned char*>(static_cast<const GuardedBuffer*>(this)->Start()); }

    size_t offset_;
    size_t size_;
    std::vector<unsigned char> storage_;
};

#endif
