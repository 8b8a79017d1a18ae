// Baseline JPEG encoder, read top to bottom:
//   1. constant tables (quantisation, Huffman, coefficient order, DCT scale factors)
//   2. the encoder's state
//   3. table building
//   4. reading the BMP into a block-padded, top-down picture
//   5. coding the blocks: a row of blocks is converted to YCbCr and transformed at once
//      (JpegColour.h, JpegTransform.h), then each block is Huffman coded into the bit writer
//      (JpegBitWriter.h)
//   6. the marker segments
//   7. a whole conversion, built in memory and written with one call, and the exported
//      functions around the lock
#include "image/output/JpegEncoder.h"

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

#include "image/output/BlockPaddedBmp.h"
#include "image/output/JpegBitWriter.h"
#include "image/output/JpegColour.h"
#include "image/output/JpegTransform.h"
#include "support/FileHandle.h"
#include "support/TraceLine.h"

namespace {

using avpost::jpeg::zigzag;

// ---------------------------------------------------------------------------------------------
// 1. Constant tables

// Example quantisation tables of the JPEG standard (luminance, chrominance), natural order.
constexpr unsigned char std_luminance_qt[64] = {
    16, 11,  10,  16, 24, 40, 51, 61, 12,  12,  14,  19,  26, 58, 60, 55,  14,  13,  16,  24, 40, 57,
    69, 56,  14,  17, 22, 29, 51, 87, 80,  62,  18,  22,  37, 56, 68, 109, 103, 77,  24,  35, 55, 64,
    81, 104, 113, 92, 49, 64, 78, 87, 103, 121, 120, 101, 72, 92, 95, 98,  112, 100, 103, 99,
};
constexpr unsigned char std_chrominance_qt[64] = {
    17, 18, 24, 47, 99, 99, 99, 99, 18, 21, 26, 66, 99, 99, 99, 99, 24, 26, 56, 99, 99, 99,
    99, 99, 47, 66, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99,
    99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99, 99,
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
    0x01, 0x02, 0x03, 0x00, 0x04, 0x11, 0x05, 0x12, 0x21, 0x31, 0x41, 0x06, 0x13, 0x51, 0x61, 0x07, 0x22, 0x71,
    0x14, 0x32, 0x81, 0x91, 0xa1, 0x08, 0x23, 0x42, 0xb1, 0xc1, 0x15, 0x52, 0xd1, 0xf0, 0x24, 0x33, 0x62, 0x72,
    0x82, 0x09, 0x0a, 0x16, 0x17, 0x18, 0x19, 0x1a, 0x25, 0x26, 0x27, 0x28, 0x29, 0x2a, 0x34, 0x35, 0x36, 0x37,
    0x38, 0x39, 0x3a, 0x43, 0x44, 0x45, 0x46, 0x47, 0x48, 0x49, 0x4a, 0x53, 0x54, 0x55, 0x56, 0x57, 0x58, 0x59,
    0x5a, 0x63, 0x64, 0x65, 0x66, 0x67, 0x68, 0x69, 0x6a, 0x73, 0x74, 0x75, 0x76, 0x77, 0x78, 0x79, 0x7a, 0x83,
    0x84, 0x85, 0x86, 0x87, 0x88, 0x89, 0x8a, 0x92, 0x93, 0x94, 0x95, 0x96, 0x97, 0x98, 0x99, 0x9a, 0xa2, 0xa3,
    0xa4, 0xa5, 0xa6, 0xa7, 0xa8, 0xa9, 0xaa, 0xb2, 0xb3, 0xb4, 0xb5, 0xb6, 0xb7, 0xb8, 0xb9, 0xba, 0xc2, 0xc3,
    0xc4, 0xc5, 0xc6, 0xc7, 0xc8, 0xc9, 0xca, 0xd2, 0xd3, 0xd4, 0xd5, 0xd6, 0xd7, 0xd8, 0xd9, 0xda, 0xe1, 0xe2,
    0xe3, 0xe4, 0xe5, 0xe6, 0xe7, 0xe8, 0xe9, 0xea, 0xf1, 0xf2, 0xf3, 0xf4, 0xf5, 0xf6, 0xf7, 0xf8, 0xf9, 0xfa,
};
constexpr unsigned char std_ac_chrominance_nrcodes[17] = {0, 0, 2, 1, 2, 4, 4, 3, 4, 7, 5, 4, 4, 0, 1, 2, 0x77};
constexpr unsigned char std_ac_chrominance_values[162] = {
    0x00, 0x01, 0x02, 0x03, 0x11, 0x04, 0x05, 0x21, 0x31, 0x06, 0x12, 0x41, 0x51, 0x07, 0x61, 0x71, 0x13, 0x22,
    0x32, 0x81, 0x08, 0x14, 0x42, 0x91, 0xa1, 0xb1, 0xc1, 0x09, 0x23, 0x33, 0x52, 0xf0, 0x15, 0x62, 0x72, 0xd1,
    0x0a, 0x16, 0x24, 0x34, 0xe1, 0x25, 0xf1, 0x17, 0x18, 0x19, 0x1a, 0x26, 0x27, 0x28, 0x29, 0x2a, 0x35, 0x36,
    0x37, 0x38, 0x39, 0x3a, 0x43, 0x44, 0x45, 0x46, 0x47, 0x48, 0x49, 0x4a, 0x53, 0x54, 0x55, 0x56, 0x57, 0x58,
    0x59, 0x5a, 0x63, 0x64, 0x65, 0x66, 0x67, 0x68, 0x69, 0x6a, 0x73, 0x74, 0x75, 0x76, 0x77, 0x78, 0x79, 0x7a,
    0x82, 0x83, 0x84, 0x85, 0x86, 0x87, 0x88, 0x89, 0x8a, 0x92, 0x93, 0x94, 0x95, 0x96, 0x97, 0x98, 0x99, 0x9a,
    0xa2, 0xa3, 0xa4, 0xa5, 0xa6, 0xa7, 0xa8, 0xa9, 0xaa, 0xb2, 0xb3, 0xb4, 0xb5, 0xb6, 0xb7, 0xb8, 0xb9, 0xba,
    0xc2, 0xc3, 0xc4, 0xc5, 0xc6, 0xc7, 0xc8, 0xc9, 0xca, 0xd2, 0xd3, 0xd4, 0xd5, 0xd6, 0xd7, 0xd8, 0xd9, 0xda,
    0xe2, 0xe3, 0xe4, 0xe5, 0xe6, 0xe7, 0xe8, 0xe9, 0xea, 0xf2, 0xf3, 0xf4, 0xf5, 0xf6, 0xf7, 0xf8, 0xf9, 0xfa,
};

// For each zigzag position, the natural index it holds.
struct NaturalOrder {
    unsigned char at[64];
};
constexpr NaturalOrder MakeNaturalOrder()
{
    NaturalOrder order{};
    for (int i = 0; i < 64; ++i)
        order.at[zigzag[i]] = static_cast<unsigned char>(i);
    return order;
}
constexpr NaturalOrder kNaturalOrder = MakeNaturalOrder();

// Scale factors that the AAN DCT leaves on its outputs, by row or column frequency.
constexpr double kAanScale[8] = {1.0, 1.387039845, 1.306562965, 1.175875602,
                                 1.0, 0.785694958, 0.541196100, 0.275899379};

// Magnitude categories run over -32767 ... 32767.
constexpr int kLargestMagnitude = 32767;
constexpr size_t kCategoryEntries = 2 * kLargestMagnitude + 1;
constexpr int kLargestCategory = 15;

constexpr unsigned char kEndOfBlock = 0x00;
constexpr unsigned char kSixteenZeros = 0xF0;
constexpr size_t kMaxPathBytes = 511;  // the paths' buffers hold 512 bytes with the terminator

// ---------------------------------------------------------------------------------------------
// 2. The encoder's state: one conversion at a time, under encoderMutex.

// One component of a row of blocks: its samples, quantised coefficients and nonzero masks.
struct ComponentRow {
    explicit ComponentRow(size_t blocks) : samples(64 * blocks), coefficients(64 * blocks), nonzero(blocks) {}
    std::vector<signed char> samples;
    std::vector<short> coefficients;
    std::vector<uint64_t> nonzero;
};

struct Encoder {
    // The picture size, padded to multiples of 8 once loaded. Kept in 32 bits so that sizes
    // just below 65536 still pad correctly.
    uint32_t width = 0;
    uint32_t height = 0;
    std::unique_ptr<unsigned char[]> RGB_buffer;  // blue, green, red; top row first
    size_t rgbBufferSize = 0;

    // The JPEG file being built: segments, then the entropy-coded data.
    avpost::jpeg::JpegBitWriter writer;

    std::vector<unsigned char> categoryTable;  // indexed by value + kLargestMagnitude
    std::vector<bitstring> bitcodeTable;

    bitstring YDC_HT[12] = {};
    bitstring YAC_HT[256] = {};
    bitstring CbDC_HT[12] = {};
    bitstring CbAC_HT[256] = {};

    unsigned char lumaQuant[64] = {};  // the DQT entries, zigzag order
    unsigned char chromaQuant[64] = {};
    float fdtbl_Y[64] = {};
    float fdtbl_Cb[64] = {};

    bool TablesBuilt() const { return !categoryTable.empty(); }
    bool PictureLoaded() const { return RGB_buffer && rgbBufferSize == size_t{width} * height * 3; }

    void PutByte(unsigned char byte) { writer.PutByte(byte); }
    void PutWord(unsigned short word);
    void WriteBits(bitstring bits);

    bool InitAll();
    bool LoadBitmap(const char* path, unsigned short* pictureWidth, unsigned short* pictureHeight);
    void MainEncoder();

    void WriteApp0();
    void WriteDqt();
    void WriteSof0(unsigned short pictureWidth, unsigned short pictureHeight);
    void WriteDht();
    void WriteSos();

    int Convert(const char* bmpPath, const char* jpegPath);
    void EncodeFile(unsigned short pictureWidth, unsigned short pictureHeight);
    void ReleaseBuffers();
};

std::mutex encoderMutex;
Encoder encoder;

void Encoder::PutWord(unsigned short word)
{
    PutByte(static_cast<unsigned char>(word >> 8));
    PutByte(static_cast<unsigned char>(word & 0xFF));
}

void Encoder::WriteBits(bitstring bits) { writer.PutBits(bits.value, bits.length); }

// ---------------------------------------------------------------------------------------------
// 3. Table building

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
        avpost::detail::TraceLine("Not enough memory.");
        return false;
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
// 4. Reading the BMP (BlockPaddedBmp.h)

bool Encoder::LoadBitmap(const char* path, unsigned short* pictureWidth, unsigned short* pictureHeight)
{
    BlockPaddedPicture picture;
    if (!ReadBlockPaddedBmp(path, picture))
        return false;
    RGB_buffer = std::move(picture.pixels);
    rgbBufferSize = picture.Bytes();
    width = picture.paddedWidth;
    height = picture.paddedHeight;
    if (pictureWidth != nullptr)
        *pictureWidth = static_cast<unsigned short>(picture.width);
    if (pictureHeight != nullptr)
        *pictureHeight = static_cast<unsigned short>(picture.height);
    return true;
}

// ---------------------------------------------------------------------------------------------
// 5. Coding the blocks

// Codes quantised blocks into a cursor. Holds copies of what the inner loop reads, so that
// nothing is read again after each byte written.
struct BlockCoder {
    const unsigned char* category;  // both indexed by values -32767 ... 32767
    const bitstring* bitcode;
    avpost::jpeg::BitCursor cursor;

    // The Huffman code of the value's category among codes, then the value's extra bits.
    void PutCoded(const bitstring* codes, int value)
    {
        const bitstring code = codes[category[value]];
        const bitstring extra = bitcode[value];
        cursor.Put((uint32_t{code.value} << extra.length) | extra.value, code.length + extra.length);
    }

    void PutCode(const bitstring& code) { cursor.Put(code.value, code.length); }

    // du: quantised coefficients in natural order; nonzero: bit k set when zigzag position k is
    // not 0. The DC codes its difference from the predictor (a difference of 0 is category 0
    // with no extra bits); each nonzero AC value codes the run of zeros before it, in whole runs
    // of sixteen first; an end-of-block code follows unless the last position is nonzero.
    void Code(const short* du, uint64_t nonzero, int& predictor, const bitstring* dcTable, const bitstring* acTable)
    {
        const int diff = du[0] - predictor;
        predictor = du[0];
        PutCoded(dcTable, diff);

        uint64_t ac = nonzero & ~uint64_t{1};
        int previous = 0;
        while (ac != 0) {
            const int position = __builtin_ctzll(ac);
            int zeros = position - previous - 1;
            for (; zeros >= 16; zeros -= 16)
                PutCode(acTable[kSixteenZeros]);
            PutCoded(acTable + zeros * 16, du[kNaturalOrder.at[position]]);
            previous = position;
            ac &= ac - 1;
        }
        if (previous != 63)
            PutCode(acTable[kEndOfBlock]);
    }
};

// A block codes at most 2021 bits (DC 31, 63 AC values of 31 each, three runs of sixteen zeros
// of 11, end of block 4); with up to 63 bits pending before it, at most 32 words leave, each
// eight bytes possibly stuffed.
constexpr size_t kMostBytesPerBlock = 32 * 16;

// Interleaved scan: one block of Y, Cb and Cr per minimum coded unit, no restart markers.
// Colour conversion and transforms run over a whole row of blocks before it is coded.
void Encoder::MainEncoder()
{
    if (!TablesBuilt() || !PictureLoaded())
        return;
    const int blocks = static_cast<int>(width / 8);
    ComponentRow y(width / 8), cb(width / 8), cr(width / 8);
    const avpost::jpeg::ColourBlockRowFunction convert = avpost::jpeg::PickColourBlockRow();
    const avpost::jpeg::TransformBlocksFunction transform = avpost::jpeg::PickTransformBlocks();
    const size_t rowBytes = size_t{width} * 3;
    int predictorY = 0;
    int predictorCb = 0;
    int predictorCr = 0;
    for (uint32_t top = 0; top < height; top += 8) {
        convert(RGB_buffer.get() + top * rowBytes, rowBytes, blocks, y.samples.data(), cb.samples.data(),
                cr.samples.data());
        transform(y.samples.data(), blocks, fdtbl_Y, y.coefficients.data(), y.nonzero.data());
        transform(cb.samples.data(), blocks, fdtbl_Cb, cb.coefficients.data(), cb.nonzero.data());
        transform(cr.samples.data(), blocks, fdtbl_Cb, cr.coefficients.data(), cr.nonzero.data());
        BlockCoder coder{categoryTable.data() + kLargestMagnitude, bitcodeTable.data() + kLargestMagnitude,
                         writer.Begin(3 * kMostBytesPerBlock * (width / 8))};
        for (int b = 0; b < blocks; ++b) {
            coder.Code(&y.coefficients[64 * b], y.nonzero[b], predictorY, YDC_HT, YAC_HT);
            coder.Code(&cb.coefficients[64 * b], cb.nonzero[b], predictorCb, CbDC_HT, CbAC_HT);
            coder.Code(&cr.coefficients[64 * b], cr.nonzero[b], predictorCr, CbDC_HT, CbAC_HT);
        }
        writer.End(coder.cursor);
    }
}

// ---------------------------------------------------------------------------------------------
// 6. Marker segments (16-bit fields most significant byte first)

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
    PutByte(0);  // spectral selection 0 ... 63
    PutByte(63);
    PutByte(0);  // no successive approximation
}

// ---------------------------------------------------------------------------------------------
// 7. A whole conversion

void Encoder::ReleaseBuffers()
{
    RGB_buffer.reset();
    rgbBufferSize = 0;
    categoryTable = std::vector<unsigned char>();
    bitcodeTable = std::vector<bitstring>();
    writer.Release();
}

// Frees the picture, the value tables and the file's bytes on every way out of a conversion.
struct BufferRelease {
    Encoder& encoder;
    ~BufferRelease() { encoder.ReleaseBuffers(); }
};

bool UsablePath(const char* path) { return path != nullptr && std::strlen(path) <= kMaxPathBytes; }

void Encoder::EncodeFile(unsigned short pictureWidth, unsigned short pictureHeight)
{
    writer.Reset();
    PutWord(0xFFD8);  // SOI
    WriteApp0();
    WriteDqt();
    WriteSof0(pictureWidth, pictureHeight);
    WriteDht();
    WriteSos();
    MainEncoder();
    writer.PadWithOnes();
    PutWord(0xFFD9);  // EOI
}

// One write. A regular file that could not be written whole is removed; anything else (a
// device, a pipe) is not ours to remove.
int WriteWholeFile(const char* path, const unsigned char* bytes, size_t size)
{
    auto file = avpost::detail::OpenFile(path, "wb");
    if (!file)
        return EOF;
    const bool written = std::fwrite(bytes, 1, size, file.get()) == size;
    const int closed = avpost::detail::CloseFile(file);
    if (written && closed == 0)
        return 0;
    std::error_code error;
    if (std::filesystem::is_regular_file(path, error))
        std::remove(path);
    return EOF;
}

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
    try {
        EncodeFile(pictureWidth, pictureHeight);
    } catch (const std::bad_alloc&) {
        return EOF;
    }
    return WriteWholeFile(jpegPath, writer.data(), writer.size());
}

}  // namespace

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

// Outside a conversion the coded bytes go nowhere; a partly filled byte stays for the next call.
void main_encoder()
{
    std::lock_guard<std::mutex> lock(encoderMutex);
    try {
        encoder.MainEncoder();
    } catch (const std::bad_alloc&) {
    }
    encoder.writer.DropBytes();
}

void writebits(bitstring bits)
{
    std::lock_guard<std::mutex> lock(encoderMutex);
    try {
        encoder.WriteBits(bits);
    } catch (const std::bad_alloc&) {
    }
    encoder.writer.DropBytes();
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
