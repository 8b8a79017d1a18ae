#include "image/output/JpegBitWriter.h"

#include <algorithm>

namespace avpost::jpeg {

void JpegBitWriter::PadWithOnes()
{
    const int fill = 8 - (64 - free_) % 8;
    Put((1u << fill) - 1, fill);
    if (bytes_.size() - used_ < kMostBytesPerWord)
        Grow();
    PutBytesStuffed(pending_, 64 - free_);
    pending_ = 0;
    free_ = 64;
}

void JpegBitWriter::PutBytesStuffed(uint64_t word, int count)
{
    unsigned char* out = bytes_.data() + used_;
    for (int shift = count - 8; shift >= 0; shift -= 8) {
        const auto byte = static_cast<unsigned char>(word >> shift);
        *out++ = byte;
        if (byte == 0xFF)
            *out++ = 0x00;
    }
    used_ = static_cast<size_t>(out - bytes_.data());
}

void JpegBitWriter::Grow()
{
    constexpr size_t kFirstSize = size_t{1} << 16;
    bytes_.resize(std::max(kFirstSize, 2 * bytes_.size()));
}

void JpegBitWriter::Release()
{
    Reset();
    bytes_ = std::vector<unsigned char>();
}

}  // namespace avpost::jpeg
