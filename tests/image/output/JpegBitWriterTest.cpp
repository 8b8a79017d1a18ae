// The bit writer of the entropy-coded data against the one-bit-at-a-time writer it replaces.
#include "image/output/JpegBitWriter.h"

#include <gtest/gtest.h>

#include <random>
#include <vector>

namespace {

using avpost::jpeg::JpegBitWriter;
using Bytes = std::vector<unsigned char>;

// Fills a byte from its most significant bit; a completed FF byte is followed by 00.
struct BitByBitWriter {
    Bytes bytes;
    unsigned char current = 0;
    int position = 7;

    void Put(uint32_t bits, int length)
    {
        for (int bit = length - 1; bit >= 0; --bit) {
            if (bit < 32 && (bits >> bit) & 1)
                current = static_cast<unsigned char>(current | 1 << position);
            if (--position < 0) {
                bytes.push_back(current);
                if (current == 0xFF)
                    bytes.push_back(0x00);
                current = 0;
                position = 7;
            }
        }
    }
    void PadWithOnes() { Put((1u << (position + 1)) - 1, position + 1); }
};

Bytes Written(const JpegBitWriter& writer) { return Bytes(writer.data(), writer.data() + writer.size()); }

// Codes of every length from 0 to 32, in stretches through cursors, runs of ones that make FF
// bytes at every bit offset and across the 64-bit word, and ends at every bit position (a
// byte-aligned end gets a whole byte of ones).
TEST(JpegBitWriter, WritesTheBitsOneAtATimeWouldWrite)
{
    std::mt19937 random(9);
    for (int run = 0; run < 300; ++run) {
        JpegBitWriter writer;
        BitByBitWriter expected;
        writer.PutByte(0xD8);
        expected.bytes.push_back(0xD8);
        for (int stretch = static_cast<int>(random() % 5); stretch > 0; --stretch) {
            const int codes = static_cast<int>(random() % 60);
            avpost::jpeg::BitCursor cursor = writer.Begin(16 * codes);
            for (int i = 0; i < codes; ++i) {
                const int length = static_cast<int>(random() % 33);
                const uint32_t mask = length == 32 ? ~0u : (1u << length) - 1;
                const uint32_t bits = (random() % 3 == 0 ? ~0u : static_cast<uint32_t>(random())) & mask;
                cursor.Put(bits, length);
                expected.Put(bits, length);
            }
            writer.End(cursor);
        }
        writer.PadWithOnes();
        expected.PadWithOnes();
        writer.PutByte(0xD9);
        expected.bytes.push_back(0xD9);
        ASSERT_EQ(Written(writer), expected.bytes) << "run " << run;
    }
}

// Codes longer than 16 bits, as a host may hand them: the bits above the 16 of the value are
// zeros, and only the code's own length counts.
TEST(JpegBitWriter, LongCodesHaveZerosAboveTheirSixteenBits)
{
    for (int length : {17, 31, 48, 255}) {
        JpegBitWriter writer;
        BitByBitWriter expected;
        writer.PutBits(0xFFFFu | 0x50000u, length);
        expected.Put(0, length - 16);
        expected.Put(0xFFFF, 16);
        writer.PutBits(0x7, 2);
        expected.Put(0x3, 2);
        writer.PadWithOnes();
        expected.PadWithOnes();
        EXPECT_EQ(Written(writer), expected.bytes) << length;
    }
}

// Dropping the written bytes keeps the bits of a partly filled byte; a reset forgets them too.
TEST(JpegBitWriter, DroppedBytesKeepThePendingBits)
{
    JpegBitWriter writer;
    for (int i = 0; i < 4; ++i)
        writer.PutBits(0xFFFF, 16);
    writer.PutBits(0xABC, 12);
    writer.DropBytes();
    writer.PutBits(0x5, 3);
    writer.PadWithOnes();
    EXPECT_EQ(Written(writer), (Bytes{0xAB, 0xCB}));
    writer.PutBits(0x1, 3);
    writer.Reset();
    writer.PadWithOnes();
    EXPECT_EQ(Written(writer), (Bytes{0xFF, 0x00}));
}

}  // namespace
