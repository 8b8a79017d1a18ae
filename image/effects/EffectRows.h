#ifndef AVPOST_IMAGE_EFFECTS_EFFECTROWS_H
#define AVPOST_IMAGE_EFFECTS_EFFECTROWS_H

// The row kernels of the picture effects. Each has its reference beside the code that calls it
// and faster variants in one file per instruction set; a variant does the same work on the
// leading part of a row (or the whole row) and returns how many bytes (or pixels) it did, and the
// caller does the rest with the reference. Variants are picked at run time (support/CpuFeatures.h). Plain
// declarations only: the instruction-set files must share no code with the rest of the library.

namespace avpost::detail {

// One stretch of a plane's values about 128, described by what it does to a value's distance
// a = |v - 128|: the distance becomes min(a * whole + f, limit) with f = (a * fraction) >> 16, or
// min(a * whole - f, limit) when `subtract` is set, on the other side of 128 when `flip` is set.
struct StretchStep {
    int whole;
    int fraction;
    int subtract;
    int limit;
    int flip;
};

// What one plane's adjustments do to each value: `table` maps every value to its result, and the
// steps describe the same map for the kernels: brightness, when not 0, adds to the value and
// clamps it to 16...235; then up to two stretches; then, after any stretch, a clamp to
// low...high.
struct ValueMap {
    unsigned char table[256];
    int brightness;
    int stretchCount;
    StretchStep stretch[2];
    int low;
    int high;
};

// Maps `count` values of a row in place.
using ValueMapKernel = int (*)(unsigned char* row, int count, const ValueMap& map);
int MapValuesAvx2(unsigned char* row, int count, const ValueMap& map);

// Relief of one luma row in place: row[c] becomes row[c] + 128 - below[c + 1], clamped to
// 16...235, for c < count (the neighbours read are below[1...count]).
using EmbossKernel = int (*)(unsigned char* row, const unsigned char* below, int count);
int EmbossRowAvx2(unsigned char* row, const unsigned char* below, int count);

// Two-level values in place: above 128 becomes `above`, the rest `atOrBelow`.
using TwoLevelKernel = int (*)(unsigned char* bytes, int count, unsigned char above, unsigned char atOrBelow);
int TwoLevelAvx2(unsigned char* bytes, int count, unsigned char above, unsigned char atOrBelow);

// Bytes negated in place (256 - b, modulo 256).
using NegateKernel = int (*)(unsigned char* bytes, int count);
int NegateAvx2(unsigned char* bytes, int count);

// Swaps the first `done` bytes of a row with its last `done`, each run reversed, and returns
// `done`, at most half the row; what lies between is left to reverse.
using MirrorEndsKernel = int (*)(unsigned char* row, int length);
int MirrorEndsAvx2(unsigned char* row, int length);

// row[c] = (above[c] + below[c]) >> 1 for c < count.
using AverageRowsKernel = int (*)(unsigned char* row, const unsigned char* above, const unsigned char* below,
                                  int count);
int AverageRowsAvx2(unsigned char* row, const unsigned char* above, const unsigned char* below, int count);

// Watermark blending. The opacity of a pixel is a = level * alpha / 100 (level 0...100), and a
// value under the watermark becomes (under * (255 - a) + over * a) / 255, or with
// `twoDivisions` (255 - a) * under / 255 + a * over / 255.

// `count` luma values of a row under the watermark values `over` with their alpha bytes.
using BlendLumaKernel = int (*)(unsigned char* under, const unsigned char* over, const unsigned char* alpha, int count,
                                int level, int twoDivisions);
int BlendLumaAvx2(unsigned char* under, const unsigned char* over, const unsigned char* alpha, int count, int level,
                  int twoDivisions);

// `count` chroma samples of a U and a V row under the watermark's, each blended with the opacity
// of the luma pixel at its block's top left: alpha[2 * i] for sample i. One division.
struct ChromaBlendRows {
    unsigned char* u;
    unsigned char* v;
    const unsigned char* overU;
    const unsigned char* overV;
    const unsigned char* alpha;
};
using BlendChromaKernel = int (*)(const ChromaBlendRows& rows, int count, int level);
int BlendChromaAvx2(const ChromaBlendRows& rows, int count, int level);

}  // namespace avpost::detail

#endif
