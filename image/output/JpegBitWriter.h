#ifndef AVPOST_IMAGE_OUTPUT_JPEGBITWRITER_H
#define AVPOST_IMAGE_OUTPUT_JPEGBITWRITER_H

#include <cstddef>
#include <cstdint>
#include <memory>

namespace avpost::jpeg {

// The writing position in the entropy-coded data. Codes go in most significant bit first and
// gather in a 64-bit word, which leaves as eight whole bytes, each FF byte followed by a 00 byte
// so that the scan holds no marker. A value: coding loops keep it in a local, where its state can
// stay in registers, and write to room that JpegBitWriter::Begin made.
struct BitCursor {
    uint64_t pending;  // the low 64 - free bits are still to be written
    int free;
    unsigned char* out;  // the next byte

    // Appends the low `length` bits of `bits` (length 0 ... 32; the bits above must be zero);
    // writes at most 16 bytes.
    void Put(uint32_t bits, int length)
    {
        if (length < free) {
            pending = (pending << length) | bits;
            free -= length;
            return;
        }
        // The word fills up: its last free bits take the code's leading bits, and the code's
        // remaining bits start the next word. Bits above the valid ones are ones already
        // written; later shifts push them out.
        const int spill = length - free;
        pending = (pending << free) | (bits >> spill);
        PutWord();
        pending = bits;
        free = 64 - spill;
    }

    // Completes the last byte with one-bits (a whole byte of them when the data ends on a byte
    // boundary) and writes out every pending bit; at most 16 bytes.
    void PadWithOnes();

private:
    void PutWord()
    {
        if (HasFFByte(pending)) {
            out = PutBytesStuffed(out, pending, 64);
            return;
        }
        for (int i = 0; i < 8; ++i)
            out[i] = static_cast<unsigned char>(pending >> (56 - 8 * i));
        out += 8;
    }

    // Exact for every word: x has a zero byte where the word has FF.
    static bool HasFFByte(uint64_t word)
    {
        const uint64_t x = ~word;
        return ((x - 0x0101010101010101ull) & ~x & 0x8080808080808080ull) != 0;
    }

    // The low `count` bits of word (a multiple of 8), most significant byte first.
    static unsigned char* PutBytesStuffed(unsigned char* out, uint64_t word, int count);
};

// The JPEG file in memory, with the bit writer of its entropy-coded data.
class JpegBitWriter {
public:
    // The cursor, with room for `bytes` bytes behind it; End takes it back.
    BitCursor Begin(size_t bytes)
    {
        if (capacity_ - used_ < bytes)
            Grow(bytes);
        return {pending_, free_, bytes_.get() + used_};
    }
    void End(const BitCursor& cursor)
    {
        pending_ = cursor.pending;
        free_ = cursor.free;
        used_ = static_cast<size_t>(cursor.out - bytes_.get());
    }

    // Codes of any length: bits beyond the low 16 of `value` count as zeros.
    void PutBits(unsigned value, int length);
    void PadWithOnes();

    // A byte outside the entropy-coded data (markers, segments): only with no bits pending.
    void PutByte(unsigned char byte)
    {
        if (used_ == capacity_)
            Grow(1);
        bytes_[used_++] = byte;
    }

    const unsigned char* data() const { return bytes_.get(); }
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
    // Room for at least `bytes` more bytes and at least twice the capacity; the written bytes
    // move along, the rest is left uninitialised.
    void Grow(size_t bytes);

    std::unique_ptr<unsigned char[]> bytes_;
    size_t capacity_ = 0;
    size_t used_ = 0;
    uint64_t pending_ = 0;
    int free_ = 64;
};

}  // namespace avpost::jpeg

#endif
