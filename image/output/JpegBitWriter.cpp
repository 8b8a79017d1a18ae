#include "image/output/JpegBitWriter.h"

#include <algorithm>
#include <cstring>
#include <utility>

namespace avpost::jpeg {

namespace {
constexpr size_t kMostBytesPerPut = 16;  // eight bytes, each possibly stuffed
}

void BitCursor::PadWithOnes()
{
    const int fill = 8 - (64 - free) % 8;
    Put((1u << fill) - 1, fill);
    out = PutBytesStuffed(out, pending, 64 - free);
    pending = 0;
    free = 64;
}

unsigned char* BitCursor::PutBytesStuffed(unsigned char* out, uint64_t word, int count)
{
    for (int shift = count - 8; shift >= 0; shift -= 8) {
        const auto byte = static_cast<unsigned char>(word >> shift);
        *out++ = byte;
        if (byte == 0xFF)
            *out++ = 0x00;
    }
    return out;
}

void JpegBitWriter::PutBits(unsigned value, int length)
{
    while (length > 16) {
        const int zeros = std::min(length - 16, 32);
        BitCursor cursor = Begin(kMostBytesPerPut);
        cursor.Put(0, zeros);
        End(cursor);
        length -= zeros;
    }
    BitCursor cursor = Begin(kMostBytesPerPut);
    cursor.Put(value & ((1u << length) - 1), length);
    End(cursor);
}

void JpegBitWriter::PadWithOnes()
{
    BitCursor cursor = Begin(2 * kMostBytesPerPut);
    cursor.PadWithOnes();
    End(cursor);
}

void JpegBitWriter::Grow(size_t bytes)
{
    constexpr size_t kFirstSize = size_t{1} << 16;
    const size_t capacity = std::max({kFirstSize, 2 * capacity_, used_ + bytes});
    std::unique_ptr<unsigned char[]> grown(new unsigned char[capacity]);
    if (used_ > 0)
        std::memcpy(grown.get(), bytes_.get(), used_);
    bytes_ = std::move(grown);
    capacity_ = capacity;
}

void JpegBitWriter::Release()
{
    Reset();
    bytes_.reset();
    capacity_ = 0;
}

}  // namespace avpost::jpeg
