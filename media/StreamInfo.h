#ifndef AVPOST_MEDIA_STREAMINFO_H
#define AVPOST_MEDIA_STREAMINFO_H

#include <cstddef>
#include <cstdint>

// The stream description every source returns. Stages copy all 1148 bytes and change only
// the fields they own, so whatever a host puts into the opaque and reserved parts reaches
// the consumer. The layout is the same 1148 bytes on 32-bit and 64-bit targets, so on
// 64-bit targets the doubles and 64-bit times sit on 4-byte boundaries: read and write them
// by member access, never through a pointer or reference to the field.
#pragma pack(push, 4)
struct STREAM_INFO {
    unsigned char header[1036];  // opaque, carried through
    struct VIDEO {
        int32_t width;
        int32_t height;
        double frameRate;  // frames per second; 0 = unknown
        int32_t reserved1[2];
        int32_t aspectX;  // display aspect, horizontal term; 0 = none given
        int32_t aspectY;  // display aspect, vertical term; 0 = none given
        int32_t reserved2[3];
    } video;
    struct AUDIO {
        int32_t sampleRate;
        int32_t channels;
        int32_t bitsPerSample;
        int32_t bytesPerSecond;
        double reserved1;
        int32_t reserved2;
    } audio;
    unsigned char reserved[16];
    int64_t firstTime;    // stream time at which the stream begins, 100 ns units
    int64_t startOffset;  // where the stream begins on the consumer's time line, 100 ns units
    unsigned char tail[8];
};
#pragma pack(pop)

static_assert(sizeof(STREAM_INFO) == 1148, "STREAM_INFO is 1148 bytes");
static_assert(sizeof(STREAM_INFO::VIDEO) == 44 && sizeof(STREAM_INFO::AUDIO) == 28, "sub-record sizes");
static_assert(offsetof(STREAM_INFO, video) == 1036 && offsetof(STREAM_INFO, audio) == 1080, "STREAM_INFO layout");
static_assert(offsetof(STREAM_INFO, video.frameRate) == 1044 && offsetof(STREAM_INFO, video.aspectX) == 1060,
              "STREAM_INFO layout");
static_assert(offsetof(STREAM_INFO, video.aspectY) == 1064 && offsetof(STREAM_INFO, audio.reserved1) == 1096,
              "STREAM_INFO layout");
static_assert(offsetof(STREAM_INFO, audio.reserved2) == 1104 && offsetof(STREAM_INFO, reserved) == 1108,
              "STREAM_INFO layout");
static_assert(offsetof(STREAM_INFO, firstTime) == 1124 && offsetof(STREAM_INFO, startOffset) == 1132,
              "STREAM_INFO layout");
static_assert(offsetof(STREAM_INFO, tail) == 1140, "STREAM_INFO layout");

// Decode parameters a host passes to its decoder's Open. The library only passes the
// address on; a host may complete this type with whatever its decoders need.
struct DecParam;

#endif
