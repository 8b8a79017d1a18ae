// Baseline JPEG encoder, read top to bottom:
//   1. constant tables (quantisation, Huffman, zigzag, DCT scale factors)
//   2. the encoder's state
//   3. the bit writer with byte stuffing
//   4. table building
//   5. reading the BMP into a block-padded, top-down picture
//   6. one 8 x 8 block: colour conversion, DCT, quantisation, Huffman coding
//   7. the marker segments
//   8. a whole conversion, and the exported functions around the lock
#include "image/output/JpegEncoder.h"

#include <algorithm>
#include <cstdint>
#include <cstdio>
#include <cstring>
#include <filesystem>
#include <memory>
#include <mutex>
#include <new>
#include <system_error>
#include <utility>
#include <vector>

#include "image/output/JpegEncoderInternals.h"

namespace {

// ---------------------------------------------------------------------------------------------
// 1. Constant tables

// Example quantisation tables of the JPEG standard (luminance, chrominance), natural order.
constexpr unsigned char std_luminance_qt[64] = {
    16, 11, 10, 16, 24,  40,  51,  61,
    12, 12, 14, 19, 26,  58,  60,  55,
    14, 13, 16, 24, 40,  57,  69,  56,
    14, 17, 22, 29, 51,  87,  80,  62,
    18, 22, 37, 56, 68,  109, 103, 77,
    24, 35, 55, 64, 81,  104, 113, 92,
    49, 64, 78, 87, 103, 121, 120, 101,
    72, 92, 95, 98, 112, 100, 103, 99,
};
constexpr unsigned char std_chrominance_qt[64] = {
    17, 18, 24, 47, 99, 99, 99, 99,
    18, 21, 26, 66, 99, 99, 99, 99,
    24, 26, 56, 99, 99, 99, 99, 99,
    47, 66, 99, 99, 99, 99, 99, 99,
    99, 99, 99, 99, 99, 99, 99, 99,
    99, 99, 99, 99, 99, 99, 99, 99,
    99, 99, 99, 99, 99, 99, 99, 99,
    99, 99, 99, 99, 99, 99, 99, 99,
};
constexpr int kQualityPercent = 50;

// Example Huffman tables of the JPEG standard. Each count array starts with an unused byte,
// then holds the number of codes of each length 1 ... 16; the values follow in code order.
constexpr unsigned char std_dc_luminance_nrcodes[17] = {0, 0, 1, 5, 1, 1, 1, 1, 1, 1, 0, 0, 0, 0, 0, 0, 0};
constexpr unsigned char std_dc_luminance_values[12] = {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11};
constexpr unsigned char std_dc_chrominance_nrcodes[17] = {0, 0, 3, 1, 1, 1, 1, 1, 1, 1, 1, 1, 0, 0, 0, 0, 0};
constexpr unsigned char std_dc_chrominance_values[12] = {0, 1, 2, 3, 4, 5, 6, 7, 8, 9, 10, 11};

constexpr unsigned char std_ac_luminance_nrcodes[17] = {0, 0, 2, 1, 3, 3, 2, 4, 3, 5, 5, 4, 4, 0, 0, 1, 0x7d};
constexpr unsigned char std_ac_luminance_values[162] = {
    0x01, 0x02, 0x03, 0x00, 0x04, 0x11, 0x05, 0x12, 0x21, 0x31, 0x41, 0x06, 0x13, 0x51, 0x61, 0x07,
    0x22, 0x71, 0x14, 0x32, 0x81, 0x91, 0xa1, 0x08, 0x23, 0x42, 0xb1, 0xc1, 0x15, 0x52, 0xd1, 0xf0,
    0x24, 0x33, 0x62, 0x72, 0x82, 0x09, 0x0a, 0x16, 0x17, 0x18, 0x19, 0x1a, 0x25, 0x26, 0x27, 0x28,
    0x29, 0x2a, 0x34, 0x35, 0x36, 0x37, 0x38, 0x39, 0x3a, 0x43, 0x44, 0x45, 0x46, 0x47, 0x48, 0x49,
    0x4a, 0x53, 0x54, 0x55, 0x56, 0x57, 0x58, 0x59, 0x5a, 0x63, 0x64, 0x65, 0x66, 0x67, 0x68, 0x69,
    0x6a, 0x73, 0x74, 0x75, 0x76, 0x77, 0x78, 0x79, 0x7a, 0x83, 0x84, 0x85, 0x86, 0x87, 0x88, 0x89,
    0x8a, 0x92, 0x93, 0x94, 0x95, 0x96, 0x97, 0x98, 0x99, 0x9a, 0xa2, 0xa3, 0xa4, 0xa5, 0xa6, 0xa7,
    0xa8, 0xa9, 0xaa, 0xb2, 0xb3, 0xb4, 0xb5, 0xb6, 0xb7, 0xb8, 0xb9, 0xba, 0xc2, 0xc3, 0xc4, 0xc5,
    0xc6, 0xc7, 0xc8, 0xc9, 0xca, 0xd2, 0xd3, 0xd4, 0xd5, 0xd6, 0xd7, 0xd8, 0xd9, 0xda, 0xe1, 0xe2,
    0xe3, 0xe4, 0xe5, 0xe6, 0xe7, 0xe8, 0xe9, 0xea, 0xf1, 0xf2, 0xf3, 0xf4, 0xf5, 0xf6, 0xf7, 0xf8,
    0xf9, 0xfa,
};
constexpr unsigned char std_ac_chrominance_nrcodes[17] = {0, 0, 2, 1, 2, 4, 4, 3, 4, 7, 5, 4, 4, 0, 1, 2, 0x77};
constexpr unsigned char std_ac_chrominance_values[162] = {
    0x00, 0x01, 0x02, 0x03, 0x11, 0x04, 0x05, 0x21, 0x31, 0x06, 0x12, 0x41, 0x51, 0x07, 0x61, 0x71,
    0x13, 0x22, 0x32, 0x81, 0x08, 0x14, 0x42, 0x91, 0xa1, 0xb1, 0xc1, 0x09, 0x23, 0x33, 0x52, 0xf0,
    0x15, 0x62, 0x72, 0xd1, 0x0a, 0x16, 0x24, 0x34, 0xe1, 0x25, 0xf1, 0x17, 0x18, 0x19, 0x1a, 0x26,
    0x27, 0x28, 0x29, 0x2a, 0x35, 0x36, 0x37, 0x38, 0x39, 0x3a, 0x43, 0x44, 0x45, 0x46, 0x47, 0x48,
    0x49, 0x4a, 0x53, 0x54, 0x55, 0x56, 0x57, 0x58, 0x59, 0x5a, 0x63, 0x64, 0x65, 0x66, 0x67, 0x68,
    0x69, 0x6a, 0x73, 0x74, 0x75, 0x76, 0x77, 0x78, 0x79, 0x7a, 0x82, 0x83, 0x84, 0x85, 0x86, 0x87,
    0x88, 0x89, 0x8a, 0x92, 0x93, 0x94, 0x95, 0x96, 0x97, 0x98, 0x99, 0x9a, 0xa2, 0xa3, 0xa4, 0xa5,
    0xa6, 0xa7, 0xa8, 0xa9, 0xaa, 0xb2, 0xb3, 0xb4, 0xb5, 0xb6, 0xb7, 0xb8, 0xb9, 0xba, 0xc2, 0xc3,
    0xc4, 0xc5, 0xc6, 0xc7, 0xc8, 0xc9, 0xca, 0xd2, 0xd3, 0xd4, 0xd5, 0xd6, 0xd7, 0xd8, 0xd9, 0xda,
    0xe2, 0xe3, 0xe4, 0xe5, 0xe6, 0xe7, 0xe8, 0xe9, 0xea, 0xf2, 0xf3, 0xf4, 0xf5, 0xf6, 0xf7, 0xf8,
    0xf9, 0xfa,
};

// For each natural (row-major) index, its position in the zigzag sequence.
constexpr unsigned char zigzag[64] = {
    0,  1,  5,  6,  14, 15, 27, 28,
    2,  4,  7,  13, 16, 26, 29, 42,
    3,  8,  12, 17, 25, 30, 41, 43,
    9,  11, 18, 24, 31, 40, 44, 53,
    10, 19, 23, 32, 39, 45, 52, 54,
    20, 22, 33, 38, 46, 51, 55, 60,
    21, 34, 37, 47, 50, 56, 59, 61,
    35, 36, 48, 49, 57, 58, 62, 63,
};

// Scale factors that the AAN DCT leaves on its outputs, by row or column frequency.
constexpr double kAanScale[8] = {1.0, 1.387039845, 1.306562965, 1.175875602,
                                 1.0, 0.785694958, 0.541196100, 0.275899379};

constexpr unsigned short mask[16] = {1,    2,    4,    8,    16,   32,   64,    128,
                                     256,  512,  1024, 2048, 4096, 8192, 16384, 32768};

// Magnitude categories run over -32767 ... 32767.
constexpr int kLargestMagnitude = 32767;
constexpr size_t kCategoryEntries = 2 * kLargestMagnitude + 1;
constexpr int kLargestCategory = 15;

constexpr unsigned char kEndOfBlock = 0x00;
constexpr unsigned char kSixteenZeros = 0xF0;
constexpr size_t kMaxPathBytes = 511;  // the paths' buffers hold 512 bytes with the terminator

constexpr size_t kBmpHeaderSize = 54;
constexpr int kBmpBitCountOffset = 28;

// ---------------------------------------------------------------------------------------------
// 2. The encoder's state: one conversion at a time, under encoderMutex.

struct Encoder {
    std::FILE* fp_jpeg_stream = nullptr;
    // The picture size, padded to multiples of 8 once loaded. Kept in 32 bits so that sizes
    // just below 65536 still pad correctly.
    uint32_t width = 0;
    uint32_t height = 0;
    std::unique_ptr<unsigned char[]> RGB_buffer;  // blue, green, red; top row first
    size_t rgbBufferSize = 0;

    unsigned char bytenew = 0;
    signed char bytepos = 7;

    std::vector<unsigned char> categoryTable;  // indexed by value + kLargestMagnitude
    std::vector<bitstring> bitcodeTable;

    bitstring YDC_HT[12] = {};
    bitstring YAC_HT[256] = {};
    bitstring CbDC_HT[12] = {};
    bitstring CbAC_HT[256] = {};

    unsigned char lumaQuant[64] = {};    // the DQT entries, zigzag order
    unsigned char chromaQuant[64] = {};
    float fdtbl_Y[64] = {};
    float fdtbl_Cb[64] = {};

    signed char YDU[64] = {};
    signed char CbDU[64] = {};
    signed char CrDU[64] = {};
    short DU_DCT[64] = {};
    short DU[64] = {};

    int32_t YRtab[256] = {}, YGtab[256] = {}, YBtab[256] = {};
    int32_t CbRtab[256] = {}, CbGtab[256] = {}, CbBtab[256] = {};
    int32_t CrRtab[256] = {}, CrGtab[256] = {}, CrBtab[256] = {};

    unsigned char category(int value) const { return categoryTable[value + kLargestMagnitude]; }
    const bitstring& bitcode(int value) const { return bitcodeTable[value + kLargestMagnitude]; }
    bool TablesBuilt() const { return !categoryTable.empty(); }
    bool PictureLoaded() const { return RGB_buffer && rgbBufferSize == size_t{width} * height * 3; }

    void PutByte(unsigned char byte);
    void PutWord(unsigned short word);
    void WriteBits(bitstring bits);

    bool InitAll();
    bool LoadBitmap(const char* path, unsigned short* pictureWidth, unsigned short* pictureHeight);
    void LoadBlock(uint32_t x, uint32_t y);
    void ProcessDU(const signed char* block, const float* divisors, int& predictor, const bitstring* dcTable,
                   const bitstring* acTable);
    void MainEncoder();

    void WriteApp0();
    void WriteDqt();
    void WriteSof0(unsigned short pictureWidth, unsigned short pictureHeight);
    void WriteDht();
    void WriteSos();

    int Convert(const char* bmpPath, const char* jpegPath);
    void ReleaseBuffers();
};

std::mutex encoderMutex;
Encoder encoder;

// ---------------------------------------------------------------------------------------------
// 3. Bit writer

void Encoder::PutByte(unsigned char byte)
{
    if (fp_jpeg_stream != nullptr)
        std::fputc(byte, fp_jpeg_stream);
}

void Encoder::PutWord(unsigned short word)
{
    PutByte(static_cast<unsigned char>(word >> 8));
    PutByte(static_cast<unsigned char>(word & 0xFF));
}

// Fills bytenew from its most significant bit down; a completed FF byte is followed by a 00
// byte so that it cannot be taken for a marker. Bits beyond the 16 of value count as zeros.
void Encoder::WriteBits(bitstring bits)
{
    for (int bit = bits.length - 1; bit >= 0; --bit) {
        if (bit < 16 && (bits.value & mask[bit]))
            bytenew = static_cast<unsigned char>(bytenew | mask[bytepos]);
        --bytepos;
        if (bytepos < 0) {
            PutByte(bytenew);
            if (bytenew == 0xFF)
                PutByte(0x00);
            bytenew = 0;
            bytepos = 7;
        }
    }
}

// ---------------------------------------------------------------------------------------------
// 4. Table building

unsigned char ScaledQuantizer(unsigned char standard)
{
    const int scaled = (standard * kQualityPercent + 50) / 100;
    return static_cast<unsigned char>(scaled < 1 ? 1 : scaled);
}

// Codes of each length follow in value order; the code doubles from one length to the next.
template <size_t N>
void ComputeHuffmanTable(const unsigned char* nrcodes, const unsigned char* values, bitstring (&table)[N])
{
    unsigned short code = 0;
    int k = 0;
    for (int length = 1; length <= 16; ++length) {
        for (int i = 0; i < nrcodes[length]; ++i, ++k) {
            table[values[k]].length = static_cast<unsigned char>(length);
            table[values[k]].value = code;
            ++code;
        }
        code = static_cast<unsigned short>(code * 2);
    }
}

// A category c holds the magnitudes 2^(c-1) ... 2^c - 1; a negative value's extra bits are
// 2^c - 1 + value, its one's complement in c bits.
void BuildCategoryTables(std::vector<unsigned char>& categories, std::vector<bitstring>& bitcodes)
{
    categories.assign(kCategoryEntries, 0);
    bitcodes.assign(kCategoryEntries, bitstring{0, 0});
    for (int c = 1; c <= kLargestCategory; ++c) {
        const int lower = 1 << (c - 1);
        const int upper = (1 << c) - 1;
        for (int v = lower; v <= upper; ++v) {
            categories[kLargestMagnitude + v] = static_cast<unsigned char>(c);
            categories[kLargestMagnitude - v] = static_cast<unsigned char>(c);
            bitcodes[kLargestMagnitude + v] = {static_cast<unsigned char>(c), static_cast<unsigned short>(v)};
            bitcodes[kLargestMagnitude - v] = {static_cast<unsigned char>(c), static_cast<unsigned short>(upper - v)};
        }
    }
}

bool Encoder::InitAll()
{
    for (int i = 0; i < 64; ++i) {
        lumaQuant[zigzag[i]] = ScaledQuantizer(std_luminance_qt[i]);
        chromaQuant[zigzag[i]] = ScaledQuantizer(std_chrominance_qt[i]);
    }

    ComputeHuffmanTable(std_dc_luminance_nrcodes, std_dc_luminance_values, YDC_HT);
    ComputeHuffmanTable(std_dc_chrominance_nrcodes, std_dc_chrominance_values, CbDC_HT);
    ComputeHuffmanTable(std_ac_luminance_nrcodes, std_ac_luminance_values, YAC_HT);
    ComputeHuffmanTable(std_ac_chrominance_nrcodes, std_ac_chrominance_values, CbAC_HT);

    try {
        BuildCategoryTables(categoryTable, bitcodeTable);
    } catch (const std::bad_alloc&) {
        ReleaseBuffers();
        std::fputs("Not enough memory.", stdout);
        return false;
    }

    // RGB to YCbCr in 16-bit fixed point (BT.601 full range).
    for (int32_t i = 0; i < 256; ++i) {
        YRtab[i] = 19595 * i;
        YGtab[i] = 38470 * i;
        YBtab[i] = 7471 * i;
        CbRtab[i] = -11058 * i;
        CbGtab[i] = -21708 * i;
        CbBtab[i] = 32768 * i;
        CrRtab[i] = 32768 * i;
        CrGtab[i] = -27438 * i;
        CrBtab[i] = -5328 * i;
    }

    // The divisors fold the DCT's scale factors and the factor 8 into the quantisers.
    for (int row = 0; row < 8; ++row) {
        for (int col = 0; col < 8; ++col) {
            const int i = 8 * row + col;
            const double qY = lumaQuant[zigzag[i]];
            const double qC = chromaQuant[zigzag[i]];
            fdtbl_Y[i] = static_cast<float>(1.0 / (qY * kAanScale[row] * kAanScale[col] * 8.0));
            fdtbl_Cb[i] = static_cast<float>(1.0 / (qC * kAanScale[row] * kAanScale[col] * 8.0));
        }
    }
    return true;
}

// ---------------------------------------------------------------------------------------------
// 5. Reading the BMP

uint32_t RoundUpTo8(uint32_t n) { return (n + 7) & ~uint32_t{7}; }

struct FileCloser {
    void operator()(std::FILE* f) const { std::fclose(f); }
};
using FilePtr = std::unique_ptr<std::FILE, FileCloser>;

// The file must hold every pixel row it announces, so a damaged header cannot make us
// allocate or encode a picture that is not there.
bool HoldsPixelRows(const char* path, uint32_t pictureHeight, uint32_t fileRowBytes)
{
    std::error_code error;
    const std::uintmax_t size = std::filesystem::file_size(path, error);
    return !error && size >= kBmpHeaderSize + std::uintmax_t{pictureHeight} * fileRowBytes;
}

// Rows are read bottom row first, each widened to whole blocks by repeating its last pixel,
// then put top row first; the bottom row is repeated down to a whole block row.
bool Encoder::LoadBitmap(const char* path, unsigned short* pictureWidth, unsigned short* pictureHeight)
{
    FilePtr file(std::fopen(path, "rb"));
    if (!file)
        return false;
    unsigned char header[kBmpHeaderSize];
    if (std::fread(header, 1, kBmpHeaderSize, file.get()) != kBmpHeaderSize || header[0] != 'B' ||
        header[1] != 'M' || header[kBmpBitCountOffset] != 24)
        return false;

    const uint32_t w = header[18] + 256u * header[19];
    const uint32_t h = header[22] + 256u * header[23];
    const uint32_t rowBytes = w * 3;
    const uint32_t padBytes = rowBytes % 4 == 0 ? 0 : 4 - rowBytes % 4;
    if (!HoldsPixelRows(path, h, rowBytes + padBytes))
        return false;

    const uint32_t w8 = RoundUpTo8(w);
    const uint32_t h8 = RoundUpTo8(h);
    const uint64_t bufferBytes = uint64_t{w8} * h8 * 3;
    if (bufferBytes > SIZE_MAX)
        return false;
    std::unique_ptr<unsigned char[]> buffer(new (std::nothrow) unsigned char[static_cast<size_t>(bufferBytes)]);
    if (!buffer)
        return false;

    const size_t bufferRow = size_t{w8} * 3;
    for (uint32_t r = 0; r < h; ++r) {
        unsigned char* row = buffer.get() + r * bufferRow;
        unsigned char padding[3];
        if (std::fread(row, 1, rowBytes, file.get()) != rowBytes ||
            std::fread(padding, 1, padBytes, file.get()) != padBytes)
            return false;
        for (uint32_t col = w; col < w8; ++col)
            std::memcpy(row + col * 3, row + (w - 1) * 3, 3);
    }
    for (uint32_t top = 0, bottom = h; top + 1 < bottom; ++top, --bottom)
        std::swap_ranges(buffer.get() + top * bufferRow, buffer.get() + (top + 1) * bufferRow,
                         buffer.get() + (bottom - 1) * bufferRow);
    for (uint32_t r = h; r < h8; ++r)
        std::memcpy(buffer.get() + r * bufferRow, buffer.get() + (h - 1) * bufferRow, bufferRow);

    RGB_buffer = std::move(buffer);
    rgbBufferSize = static_cast<size_t>(bufferBytes);
    width = w8;
    height = h8;
    if (pictureWidth != nullptr)
        *pictureWidth = static_cast<unsigned short>(w);
    if (pictureHeight != nullptr)
        *pictureHeight = static_cast<unsigned short>(h);
    return true;
}

// ---------------------------------------------------------------------------------------------
// 6. One 8 x 8 block

// Luma is level-shifted by 128; the chroma products already centre on 0. The shifts are
// arithmetic, rounding toward minus infinity.
void Encoder::LoadBlock(uint32_t x, uint32_t y)
{
    for (int pos = 0; pos < 64; ++pos) {
        const size_t location = (size_t{y} + pos / 8) * width * 3 + (size_t{x} + pos % 8) * 3;
        const unsigned char blue = RGB_buffer[location];
        const unsigned char green = RGB_buffer[location + 1];
        const unsigned char red = RGB_buffer[location + 2];
        YDU[pos] = static_cast<signed char>(((YRtab[red] + YGtab[green] + YBtab[blue]) >> 16) - 128);
        CbDU[pos] = static_cast<signed char>((CbRtab[red] + CbGtab[green] + CbBtab[blue]) >> 16);
        CrDU[pos] = static_cast<signed char>((CrRtab[red] + CrGtab[green] + CrBtab[blue]) >> 16);
    }
}

// One-dimensional AAN DCT over eight values step apart.
void DctPass(float* d, int step)
{
    constexpr float c4 = 0.707106781f;  // cos(4 pi / 16)
    constexpr float r2c6 = 0.382683433f;
    constexpr float c2mc6 = 0.541196100f;
    constexpr float c2pc6 = 1.306562965f;

    const float tmp0 = d[0] + d[7 * step];
    const float tmp7 = d[0] - d[7 * step];
    const float tmp1 = d[step] + d[6 * step];
    const float tmp6 = d[step] - d[6 * step];
    const float tmp2 = d[2 * step] + d[5 * step];
    const float tmp5 = d[2 * step] - d[5 * step];
    const float tmp3 = d[3 * step] + d[4 * step];
    const float tmp4 = d[3 * step] - d[4 * step];

    // Even part.
    const float tmp10 = tmp0 + tmp3;
    const float tmp13 = tmp0 - tmp3;
    const float tmp11 = tmp1 + tmp2;
    const float tmp12 = tmp1 - tmp2;
    d[0] = tmp10 + tmp11;
    d[4 * step] = tmp10 - tmp11;
    const float z1 = (tmp12 + tmp13) * c4;
    d[2 * step] = tmp13 + z1;
    d[6 * step] = tmp13 - z1;

    // Odd part.
    const float odd10 = tmp4 + tmp5;
    const float odd11 = tmp5 + tmp6;
    const float odd12 = tmp6 + tmp7;
    const float z5 = (odd10 - odd12) * r2c6;
    const float z2 = c2mc6 * odd10 + z5;
    const float z4 = c2pc6 * odd12 + z5;
    const float z3 = odd11 * c4;
    const float z11 = tmp7 + z3;
    const float z13 = tmp7 - z3;
    d[5 * step] = z13 + z2;
    d[3 * step] = z13 - z2;
    d[1 * step] = z11 + z4;
    d[7 * step] = z11 - z4;
}

// Single-precision Arai-Agui-Nakajima DCT in place, rows first, then columns. The outputs
// carry the AAN scale factors, which the quantisation divisors remove.
void ForwardDctAan(float block[64])
{
    for (int row = 0; row < 8; ++row)
        DctPass(block + 8 * row, 1);
    for (int col = 0; col < 8; ++col)
        DctPass(block + col, 8);
}

void Encoder::ProcessDU(const signed char* block, const float* divisors, int& predictor, const bitstring* dcTable,
                        const bitstring* acTable)
{
    float coefficients[64];
    for (int i = 0; i < 64; ++i)
        coefficients[i] = block[i];
    ForwardDctAan(coefficients);
    for (int i = 0; i < 64; ++i)
        DU_DCT[i] = avpost::detail::QuantizeCoefficient(coefficients[i], divisors[i]);
    for (int i = 0; i < 64; ++i)
        DU[zigzag[i]] = DU_DCT[i];

    const int diff = DU[0] - predictor;
    predictor = DU[0];
    if (diff == 0) {
        WriteBits(dcTable[0]);
    } else {
        WriteBits(dcTable[category(diff)]);
        WriteBits(bitcode(diff));
    }

    int end = 63;
    while (end > 0 && DU[end] == 0)
        --end;
    if (end == 0) {
        WriteBits(acTable[kEndOfBlock]);
        return;
    }
    for (int i = 1; i <= end;) {
        const int start = i;
        while (DU[i] == 0)
            ++i;
        int zeros = i - start;
        for (; zeros >= 16; zeros -= 16)
            WriteBits(acTable[kSixteenZeros]);
        WriteBits(acTable[zeros * 16 + category(DU[i])]);
        WriteBits(bitcode(DU[i]));
        ++i;
    }
    if (end != 63)
        WriteBits(acTable[kEndOfBlock]);
}

// Interleaved scan: one block of Y, Cb and Cr per minimum coded unit, no restart markers.
void Encoder::MainEncoder()
{
    if (!TablesBuilt() || !PictureLoaded())
        return;
    int predictorY = 0;
    int predictorCb = 0;
    int predictorCr = 0;
    for (uint32_t y = 0; y < height; y += 8) {
        for (uint32_t x = 0; x < width; x += 8) {
            LoadBlock(x, y);
            ProcessDU(YDU, fdtbl_Y, predictorY, YDC_HT, YAC_HT);
            ProcessDU(CbDU, fdtbl_Cb, predictorCb, CbDC_HT, CbAC_HT);
            ProcessDU(CrDU, fdtbl_Cb, predictorCr, CbDC_HT, CbAC_HT);
        }
    }
}

// ---------------------------------------------------------------------------------------------
// 7. Marker segments (16-bit fields most significant byte first)

void Encoder::WriteApp0()
{
    PutWord(0xFFE0);
    PutWord(16);
    for (char c : {'J', 'F', 'I', 'F', '\0'})
        PutByte(static_cast<unsigned char>(c));
    PutByte(1);  // version 1.1
    PutByte(1);
    PutByte(0);  // no density unit: the densities give the pixel aspect, 1:1
    PutWord(1);
    PutWord(1);
    PutByte(0);  // no thumbnail
    PutByte(0);
}

void Encoder::WriteDqt()
{
    PutWord(0xFFDB);
    PutWord(132);
    PutByte(0x00);
    for (unsigned char q : lumaQuant)
        PutByte(q);
    PutByte(0x01);
    for (unsigned char q : chromaQuant)
        PutByte(q);
}

void Encoder::WriteSof0(unsigned short pictureWidth, unsigned short pictureHeight)
{
    PutWord(0xFFC0);
    PutWord(17);
    PutByte(8);  // bits per sample
    PutWord(pictureHeight);
    PutWord(pictureWidth);
    PutByte(3);
    const unsigned char components[3][3] = {{1, 0x11, 0}, {2, 0x11, 1}, {3, 0x11, 1}};  // id, sampling, table
    for (const auto& component : components)
        for (unsigned char b : component)
            PutByte(b);
}

void WriteHuffmanTable(Encoder& e, unsigned char classAndId, const unsigned char* nrcodes, const unsigned char* values,
                       size_t valueCount)
{
    e.PutByte(classAndId);
    for (int length = 1; length <= 16; ++length)
        e.PutByte(nrcodes[length]);
    for (size_t i = 0; i < valueCount; ++i)
        e.PutByte(values[i]);
}

void Encoder::WriteDht()
{
    PutWord(0xFFC4);
    PutWord(418);
    WriteHuffmanTable(*this, 0x00, std_dc_luminance_nrcodes, std_dc_luminance_values, 12);
    WriteHuffmanTable(*this, 0x10, std_ac_luminance_nrcodes, std_ac_luminance_values, 162);
    WriteHuffmanTable(*this, 0x01, std_dc_chrominance_nrcodes, std_dc_chrominance_values, 12);
    WriteHuffmanTable(*this, 0x11, std_ac_chrominance_nrcodes, std_ac_chrominance_values, 162);
}

void Encoder::WriteSos()
{
    PutWord(0xFFDA);
    PutWord(12);
    PutByte(3);
    const unsigned char components[3][2] = {{1, 0x00}, {2, 0x11}, {3, 0x11}};  // id, DC/AC tables
    for (const auto& component : components)
        for (unsigned char b : component)
            PutByte(b);
    PutByte(0);   // spectral selection 0 ... 63
    PutByte(63);
    PutByte(0);   // no successive approximation
}

// ---------------------------------------------------------------------------------------------
// 8. A whole conversion

void Encoder::ReleaseBuffers()
{
    RGB_buffer.reset();
    rgbBufferSize = 0;
    categoryTable = std::vector<unsigned char>();
    bitcodeTable = std::vector<bitstring>();
}

// Frees the picture and the value tables on every way out of a conversion.
struct BufferRelease {
    Encoder& encoder;
    ~BufferRelease() { encoder.ReleaseBuffers(); }
};

bool UsablePath(const char* path) { return path != nullptr && std::strlen(path) <= kMaxPathBytes; }

int Encoder::Convert(const char* bmpPath, const char* jpegPath)
{
    if (!UsablePath(bmpPath) || !UsablePath(jpegPath))
        return 0;
    unsigned short pictureWidth = 0;
    unsigned short pictureHeight = 0;
    if (!LoadBitmap(bmpPath, &pictureWidth, &pictureHeight))
        return 0;
    BufferRelease release{*this};
    if (!InitAll())
        return EOF;
    fp_jpeg_stream = std::fopen(jpegPath, "wb");
    if (fp_jpeg_stream == nullptr)
        return EOF;

    PutWord(0xFFD8);  // SOI
    WriteApp0();
    WriteDqt();
    WriteSof0(pictureWidth, pictureHeight);
    WriteDht();
    WriteSos();

    bytenew = 0;
    bytepos = 7;
    MainEncoder();
    // bytepos is never negative here, so a byte-aligned scan still gets one byte of ones.
    if (bytepos >= 0) {
        const int fill = bytepos + 1;
        WriteBits({static_cast<unsigned char>(fill), static_cast<unsigned short>((1 << fill) - 1)});
    }
    PutWord(0xFFD9);  // EOI

    const int closed = std::fclose(fp_jpeg_stream);
    fp_jpeg_stream = nullptr;
    return closed;
}

}  // namespace

namespace avpost::detail {

short QuantizeCoefficient(float coefficient, float divisor)
{
    const float product = coefficient * divisor;
    return static_cast<short>(static_cast<int>(static_cast<double>(product) + 16384.5) - 16384);
}

}  // namespace avpost::detail

int BMP2JPEG(const char* bmpPath, const char* jpegPath)
{
    std::lock_guard<std::mutex> lock(encoderMutex);
    return encoder.Convert(bmpPath, jpegPath);
}

int load_bitmap(const char* path, unsigned short* pictureWidth, unsigned short* pictureHeight)
{
    std::lock_guard<std::mutex> lock(encoderMutex);
    return path != nullptr && encoder.LoadBitmap(path, pictureWidth, pictureHeight) ? 1 : 0;
}

void init_all()
{
    std::lock_guard<std::mutex> lock(encoderMutex);
    encoder.InitAll();
}

void main_encoder()
{
    std::lock_guard<std::mutex> lock(encoderMutex);
    encoder.MainEncoder();
}

void writebits(bitstring bits)
{
    std::lock_guard<std::mutex> lock(encoderMutex);
    encoder.WriteBits(bits);
}

int FetchMatrix(int height, int width, const unsigned char* plane, signed char* block, int x, int y, int fill)
{
    if (x >= width || y >= height || plane == nullptr || block == nullptr)
        return 0;
    for (int r = 0; r < 8; ++r) {
        for (int c = 0; c < 8; ++c) {
            const int64_t px = int64_t{x} + c;
            const int64_t py = int64_t{y} + r;
            const bool inside = px >= 0 && px < width && py >= 0 && py < height;
            block[8 * r + c] = static_cast<signed char>(inside ? plane[py * width + px] : fill);
        }
    }
    return 1;
}
