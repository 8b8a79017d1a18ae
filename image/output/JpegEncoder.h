#ifndef AVPOST_IMAGE_OUTPUT_JPEGENCODER_H
#define AVPOST_IMAGE_OUTPUT_JPEGENCODER_H

#include "../../media/AvpostApi.h"

// A small baseline JPEG encoder: a plain 24-bit BMP file in (54-byte header, bottom-up rows),
// a JFIF file out with three components at full resolution, the example quantisation tables of
// the JPEG standard at 50 % and its example Huffman tables. There is no quality setting.
//
// The encoder keeps its working state in one process-wide place, guarded by a lock: conversions
// started on several threads run one after the other, and the step functions below lock it too.

// A Huffman code or a run of extra bits: length bits, right-aligned in value.
struct bitstring {
    unsigned char length;
    unsigned short value;
};

// Converts the BMP file into a JPEG file. Returns 0 when the BMP cannot be used (cannot be
// opened, shorter than its header and pixel rows, not "BM", not 24 bits per pixel, no memory
// for the picture) or either name is null or longer than 511 bytes; nothing is written then.
// The JPEG is built in memory and written with one call: when memory is missing or the file
// cannot be created or written whole, returns EOF, and a partly written file is removed.
// Otherwise returns the result of closing the JPEG file, 0.
AVPOST_API int BMP2JPEG(const char* bmpPath, const char* jpegPath);

// The steps of a conversion, for hosts that drive them one by one. They share the encoder's
// state: load_bitmap reads a BMP into the picture buffer (padded to whole 8 x 8 blocks by
// repeating the last column and row) and reports its own size; init_all builds the tables;
// main_encoder codes every block through writebits, which appends bits to the JPEG of the
// conversion in progress (outside a conversion, completed bytes go nowhere). main_encoder
// does nothing without a loaded picture and built tables.
AVPOST_API int load_bitmap(const char* path, unsigned short* pictureWidth, unsigned short* pictureHeight);
AVPOST_API void init_all();
AVPOST_API void main_encoder();
AVPOST_API void writebits(bitstring bits);

// Copies the 8 x 8 block whose top left pixel is (x, y) from a plane of height rows of width
// bytes into block, row by row, with fill wherever the block lies outside the plane. Returns
// 0 (and copies nothing) when x >= width, y >= height or a pointer is null, else 1.
AVPOST_API int FetchMatrix(int height, int width, const unsigned char* plane, signed char* block, int x, int y,
                           int fill);

#endif
