#ifndef AVPOST_IMAGE_OUTPUT_JPEGAANDCT_H
#define AVPOST_IMAGE_OUTPUT_JPEGAANDCT_H

// One pass of the single-precision fast DCT of Arai, Agui and Nakajima: eight values `step`
// apart, transformed in place. Its outputs carry the AAN scale factors.
//
// T is float for the reference, or a vector of floats (__m128, __m256) whose every lane runs the
// same pass with exactly these operations in this order, so all give the same bits (the build
// never contracts a product and a sum into one rounding). static, with its instances inlined:
// each instruction set's file keeps its own copy, and none is shared through the linker.
namespace avpost::jpeg {

template <typename T>
[[gnu::always_inline]] static inline void AanDctPass(T* d, int step)
{
    constexpr float c4 = 0.707106781f;  // cos(4 pi / 16)
    constexpr float r2c6 = 0.382683433f;
    constexpr float c2mc6 = 0.541196100f;
    constexpr float c2pc6 = 1.306562965f;

    const T tmp0 = d[0] + d[7 * step];
    const T tmp7 = d[0] - d[7 * step];
    const T tmp1 = d[step] + d[6 * step];
    const T tmp6 = d[step] - d[6 * step];
    const T tmp2 = d[2 * step] + d[5 * step];
    const T tmp5 = d[2 * step] - d[5 * step];
    const T tmp3 = d[3 * step] + d[4 * step];
    const T tmp4 = d[3 * step] - d[4 * step];

    // Even part.
    const T tmp10 = tmp0 + tmp3;
    const T tmp13 = tmp0 - tmp3;
    const T tmp11 = tmp1 + tmp2;
    const T tmp12 = tmp1 - tmp2;
    d[0] = tmp10 + tmp11;
    d[4 * step] = tmp10 - tmp11;
    const T z1 = (tmp12 + tmp13) * c4;
    d[2 * step] = tmp13 + z1;
    d[6 * step] = tmp13 - z1;

    // Odd part.
    const T odd10 = tmp4 + tmp5;
    const T odd11 = tmp5 + tmp6;
    const T odd12 = tmp6 + tmp7;
    const T z5 = (odd10 - odd12) * r2c6;
    const T z2 = c2mc6 * odd10 + z5;
    const T z4 = c2pc6 * odd12 + z5;
    const T z3 = odd11 * c4;
    const T z11 = tmp7 + z3;
    const T z13 = tmp7 - z3;
    d[5 * step] = z13 + z2;
    d[3 * step] = z13 - z2;
    d[1 * step] = z11 + z4;
    d[7 * step] = z11 - z4;
}

}  // namespace avpost::jpeg

#endif
