#ifndef AVPOST_MEDIA_MEDIAFRAME_H
#define AVPOST_MEDIA_MEDIAFRAME_H

#include <cstddef>
#include <cstdint>

#include "AvpostApi.h"

// One video picture (planar YUV 4:2:0, YV12 memory order) or one block of interleaved PCM.
// Host decoders built separately read and write this record, so its layout is a binary
// contract: on 32-bit x86 it is exactly 76 bytes with the offsets checked below; on 64-bit
// targets the field order is the same and pointers have their natural width.
//
// Times are 100-nanosecond units; -1 in startTime/streamTime and 0 in duration mean unknown.
struct MEDIA_FRAME {
    int32_t type;    // 2: planar YUV 4:2:0; 3: PCM samples
    int32_t param1;  // video: 1; audio: sample rate in Hz
    int32_t param2;  // video: 2; audio: channel count
    // The same words seen as plane pointers (video) or as the sample buffer (audio).
    // Each audio word is pointer-aligned so the two views share their slots on every target.
    // Anonymous structs are an extension every x86 compiler accepts; __extension__ keeps hosts
    // that build with -Wpedantic silent.
    union {
        unsigned char* plane[4];  // Y, U (Cb), V (Cr), alpha or null
        __extension__ struct {
            alignas(void*) int32_t bitsPerSample;
            unsigned char* data;                // interleaved samples
            alignas(void*) int32_t dataSize;    // valid bytes in data
            alignas(void*) int32_t bufferSize;  // capacity of data in bytes
        };
    };
    int32_t width;
    int32_t height;
    int32_t pitch[3];  // Y, U, V row strides in bytes
    int32_t reserved[2];
    int64_t startTime;
    int64_t streamTime;
    int32_t duration;
};

#if defined(__i386__)
static_assert(sizeof(MEDIA_FRAME) == 76, "MEDIA_FRAME is 76 bytes on 32-bit x86");
static_assert(offsetof(MEDIA_FRAME, param1) == 4 && offsetof(MEDIA_FRAME, param2) == 8, "MEDIA_FRAME layout");
static_assert(offsetof(MEDIA_FRAME, plane) == 12 && offsetof(MEDIA_FRAME, bitsPerSample) == 12, "MEDIA_FRAME layout");
static_assert(offsetof(MEDIA_FRAME, data) == 16 && offsetof(MEDIA_FRAME, dataSize) == 20, "MEDIA_FRAME layout");
static_assert(offsetof(MEDIA_FRAME, bufferSize) == 24 && offsetof(MEDIA_FRAME, width) == 28, "MEDIA_FRAME layout");
static_assert(offsetof(MEDIA_FRAME, height) == 32 && offsetof(MEDIA_FRAME, pitch) == 36, "MEDIA_FRAME layout");
static_assert(offsetof(MEDIA_FRAME, reserved) == 48 && offsetof(MEDIA_FRAME, startTime) == 56, "MEDIA_FRAME layout");
static_assert(offsetof(MEDIA_FRAME, streamTime) == 64 && offsetof(MEDIA_FRAME, duration) == 72, "MEDIA_FRAME layout");
#endif

namespace avpost {
// The values of MEDIA_FRAME::type.
constexpr int32_t kFrameTypeYV12 = 2;
constexpr int32_t kFrameTypePcm = 3;
// Time fields count 100-nanosecond units.
constexpr double kUnitsPerSecond = 10000000.0;
}  // namespace avpost

// A new video frame owning one block: Y, V, U, the alpha plane when asked for, then 512 spare
// bytes. With clear, Y is black (16), chroma neutral (128) and alpha opaque (255).
AVPOST_API MEDIA_FRAME* CreateYV12Frame(int width, int height, bool withAlpha, bool clear);
// Frees a frame made by CreateYV12Frame; null is ignored.
AVPOST_API void ReleaseYV12Frame(MEDIA_FRAME* frame);
// Copies the Y, U and V pictures (rows of dst's pitch) and, when asked, the three time fields.
// Both frames must have the same picture size; dst's pitches must not exceed src's.
AVPOST_API void CopyVideoFrame(MEDIA_FRAME* dst, const MEDIA_FRAME* src, bool copyTimes);
// A new audio frame with a zeroed sample buffer of bufferSize bytes and no valid data.
AVPOST_API MEDIA_FRAME* CreateAudioFrame(int sampleRate, int channels, int bitsPerSample, int bufferSize);
// Frees a frame made by CreateAudioFrame; null is ignored.
AVPOST_API void ReleaseAudioFrame(MEDIA_FRAME* frame);

#endif
