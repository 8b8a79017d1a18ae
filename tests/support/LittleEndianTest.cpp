#include "support/LittleEndian.h"

#include <gtest/gtest.h>

#include <cstdint>
#include <string>
#include <vector>

namespace {

using namespace avpost::detail;
using Bytes = std::vector<unsigned char>;

// Top bits set catch a read that goes through a signed int or sign-extends, and a store that
// keeps more than its width.
TEST(LittleEndian, LowByteFirstWithoutSignExtensionAndRoundTrips)
{
    const struct {
        uint32_t value;
        Bytes le16;
        Bytes le32;
    } cases[] = {
        {0x12345678, {0x78, 0x56}, {0x78, 0x56, 0x34, 0x12}},
        {0xFFFF8001, {0x01, 0x80}, {0x01, 0x80, 0xFF, 0xFF}},
        {0x80000000, {0x00, 0x00}, {0x00, 0x00, 0x00, 0x80}},
        {0xFFFFFFFF, {0xFF, 0xFF}, {0xFF, 0xFF, 0xFF, 0xFF}},
    };
    for (const auto& c : cases) {
        Bytes stored(6, 0xCD), expected = c.le32;  // guard bytes after the value
        StoreLe32(stored.data(), c.value);
        expected.resize(stored.size(), 0xCD);
        EXPECT_EQ(stored, expected) << std::hex << c.value;
        EXPECT_EQ(ReadLe32(c.le32.data()), c.value);

        stored.assign(4, 0xCD);
        expected = c.le16;
        StoreLe16(stored.data(), c.value);
        expected.resize(stored.size(), 0xCD);
        EXPECT_EQ(stored, expected) << std::hex << c.value;
        EXPECT_EQ(ReadLe16(c.le16.data()), c.value & 0xFFFF);
    }
}

TEST(LittleEndian, AppendsToVectorsAndStrings)
{
    Bytes bytes = {'B'};
    AppendLe16(bytes, 0xFEFF);
    AppendLe32(bytes, 0x01020304);
    EXPECT_EQ(bytes, (Bytes{'B', 0xFF, 0xFE, 0x04, 0x03, 0x02, 0x01}));
    std::string text = "B";
    AppendLe16(text, 0xFEFF);
    AppendLe32(text, 0x01020304);
    EXPECT_EQ(text, std::string(bytes.begin(), bytes.end()));
}

}  // namespace
