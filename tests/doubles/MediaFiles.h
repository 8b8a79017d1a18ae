#ifndef AVPOST_TESTS_DOUBLES_MEDIAFILES_H
#define AVPOST_TESTS_DOUBLES_MEDIAFILES_H

#include <cstdint>
#include <string>
#include <vector>

#include "support/LittleEndian.h"

// Small valid files of the formats the tool reads, for tests and as fuzz seeds.
namespace media_files {

using avpost::detail::AppendLe16;
using avpost::detail::AppendLe32;

// An uncompressed BMP of w x h pixels of `bits` (24 or 32) per pixel, rows padded to 4 bytes,
// bottom-up unless h is negative.
inline std::vector<uint8_t> Bmp(int w, int h, int bits, uint8_t shade)
{
    const uint32_t rows = static_cast<uint32_t>(h < 0 ? -h : h);
    const uint32_t rowBytes = (static_cast<uint32_t>(w) * bits / 8 + 3) & ~3u;
    std::vector<uint8_t> file = {'B', 'M'};
    AppendLe32(file, 54 + rowBytes * rows);
    AppendLe32(file, 0);
    AppendLe32(file, 54);
    AppendLe32(file, 40);
    AppendLe32(file, static_cast<uint32_t>(w));
    AppendLe32(file, static_cast<uint32_t>(h));
    AppendLe16(file, 1);
    AppendLe16(file, static_cast<uint32_t>(bits));
    for (int i = 0; i < 6; ++i)
        AppendLe32(file, 0);
    for (uint32_t i = 0; i < rowBytes * rows; ++i)
        file.push_back(static_cast<uint8_t>(shade + i * 7));
    return file;
}

// A 4:2:0 YUV4MPEG2 stream of `pictures` pictures of w x h with the given header parameters.
inline std::vector<uint8_t> Y4m(int w, int h, int pictures, const std::string& parameters)
{
    const std::string header = "YUV4MPEG2 W" + std::to_string(w) + " H" + std::to_string(h) + parameters + "\n";
    std::vector<uint8_t> file(header.begin(), header.end());
    const size_t picture = static_cast<size_t>(w) * h + 2 * static_cast<size_t>((w + 1) / 2) * ((h + 1) / 2);
    for (int p = 0; p < pictures; ++p) {
        for (char c : std::string("FRAME\n"))
            file.push_back(static_cast<uint8_t>(c));
        for (size_t i = 0; i < picture; ++i)
            file.push_back(static_cast<uint8_t>(16 + (i * 3 + p) % 220));
    }
    return file;
}

// A 16-bit PCM WAV file; with a channel mask it is written as WAVE_FORMAT_EXTENSIBLE.
inline std::vector<uint8_t> Wav(int rate, int channels, int frames, uint32_t channelMask = 0)
{
    const bool extensible = channelMask != 0;
    const uint32_t formatBytes = extensible ? 40 : 16, dataBytes = static_cast<uint32_t>(frames * channels * 2);
    std::vector<uint8_t> file = {'R', 'I', 'F', 'F'};
    AppendLe32(file, 4 + 8 + formatBytes + 8 + dataBytes);
    for (char c : std::string("WAVEfmt "))
        file.push_back(static_cast<uint8_t>(c));
    AppendLe32(file, formatBytes);
    AppendLe16(file, extensible ? 0xFFFE : 1);
    AppendLe16(file, static_cast<uint32_t>(channels));
    AppendLe32(file, static_cast<uint32_t>(rate));
    AppendLe32(file, static_cast<uint32_t>(rate * channels * 2));
    AppendLe16(file, static_cast<uint32_t>(channels * 2));
    AppendLe16(file, 16);
    if (extensible) {
        AppendLe16(file, 22);
        AppendLe16(file, 16);
        AppendLe32(file, channelMask);
        const uint8_t pcm[16] = {1, 0, 0, 0, 0, 0, 0x10, 0, 0x80, 0, 0, 0xAA, 0, 0x38, 0x9B, 0x71};
        file.insert(file.end(), pcm, pcm + 16);
    }
    for (char c : std::string("data"))
        file.push_back(static_cast<uint8_t>(c));
    AppendLe32(file, dataBytes);
    for (uint32_t i = 0; i < dataBytes; ++i)
        file.push_back(static_cast<uint8_t>(i * 13));
    return file;
}

}  // namespace media_files

#endif
