#include <gtest/gtest.h>

#include <cstddef>

#include "media/MediaFrame.h"

namespace {

// The 32-bit offsets are fixed by static_asserts in the headers; these checks keep the
// 64-bit shape honest: same field order, and the audio words sharing the plane slots.
TEST(Layout, AudioWordsShareThePlaneSlots)
{
    EXPECT_EQ(offsetof(MEDIA_FRAME, bitsPerSample), offsetof(MEDIA_FRAME, plane));
    EXPECT_EQ(offsetof(MEDIA_FRAME, data), offsetof(MEDIA_FRAME, plane) + sizeof(void*));
    EXPECT_EQ(offsetof(MEDIA_FRAME, dataSize), offsetof(MEDIA_FRAME, plane) + 2 * sizeof(void*));
    EXPECT_EQ(offsetof(MEDIA_FRAME, bufferSize), offsetof(MEDIA_FRAME, plane) + 3 * sizeof(void*));
}

}  // namespace
