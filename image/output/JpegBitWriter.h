#ifndef AVPOST_IMAGE_OUTPUT_JPEGBITWRITER_H
#define AVPOST_IMAGE_OUTPUT_JPEGBITWRITER_H

#include <cstddef>
#include <cstdint>
#include <vector>

namespace avpost::jpeg {

// The JPEG file in memory, with the bit writer of its entropy-coded data. Codes go in most
// significant bit first; whole bytes come out, each FF byte followed by a 00 byte so that the
// scan holds no marker. Codes gather in a 64-bit word that leaves eight bytes at a time.
class JpegBitWriter {
public:
    // Appends the low `length` bits of `bits` (length 0 ... 32; the bits above must be zero).
    void Put(uint32_t bits, int length)
    {
        if (length < free_) {
            pending_ = (pending_ << length) | bits;
            free_ -= length;
            return;
        }
        // The word fills up: its last free bits take the code's leading bits, and the code's
        // remaining bits start the next word. Bits above the valid ones are ones already
        // written; later shifts push them out.
        const int spill = length - free_;
        pending_ = (pending_ << free_) | (bits >> spill);
        PutWord();
        pending_ = bits;
        free_ = 64 - spill;
    }

    // Completes the last byte with one-bits (a whole byte of them when the data ends on a byte
    // boundary) and writes out every pending bit.
    void PadWithOnes();

    // A byte outside the entropy-coded data (markers, segments): only with no bits pending.
    void PutByte(unsigned char byte)
    {
        if (used_ == bytes_.size())
            Grow();
        bytes_[used_++] = byte;
    }

    const unsigned char* data() const { return bytes_.data(); }
    size_t size() const { return used_; }

    // Forgets the bytes written so far; pending bits stay.
    void DropBytes() { used_ = 0; }
    // No bytes, no pending bits.
    void Reset()
    {
        used_ = 0;
        pending_ = 0;
        free_ = 64;
    }
    // Gives the memory back.
    void Release();

private:
    static constexpr size_t kMostBytesPerWord = 16;  // eight bytes, each possibly stuffed

    void PutWord()
    {
        if (bytes_.size() - used_ < kMostBytesPerWord)
            Grow();
        unsigned char* out = bytes_.data() + used_;
        if (!HasFFByte(pending_)) {
            for (int i = 0; i < 8; ++i)
                out[i] = static_cast<unsigned char>(pending_ >> (56 - 8 * i));
            used_ += 8;
            return;
        }
        PutBytesStuffed(pending_, 64);
    }

    // Exact for every word: x has a zero byte where the word has FF.
    static bool HasFFByte(uint64_t word)
    {
        const uint64_t x = ~word;
        return ((x - 0x0101010101010101ull) & ~x & 0x8080808080808080ull) != 0;
    }

    // The low `count` bits of word (a multiple of 8), most significant byte first.
    void PutBytesStuffed(uint64_t word, int count);
    void Grow();

    std::vector<unsigned char> bytes_;
    size_t used_ = 0;
    uint64_t pending_ = 0;  // the low 64 - free_ bits are still to be written
    int free_ = 64;
};

}  // namespace avpost::jpeg

#endif
