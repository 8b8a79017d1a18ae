#include "LibjpegReader.h"

#include <algorithm>
#include <csetjmp>
#include <cstdio>

#include <jpeglib.h>

namespace avpost_test {
namespace {

// libjpeg's fatal errors jump back here; the functions that set the jump keep their results
// in the caller's objects.
struct Trap {
    jpeg_error_mgr manager;
    std::jmp_buf jump;
    int warnings = 0;
};

void JumpBack(j_common_ptr codec) { std::longjmp(reinterpret_cast<Trap*>(codec->err)->jump, 1); }

void CountWarnings(j_common_ptr codec, int level)
{
    if (level < 0)
        ++reinterpret_cast<Trap*>(codec->err)->warnings;
}

jpeg_error_mgr* Install(Trap& trap)
{
    jpeg_std_error(&trap.manager);
    trap.manager.error_exit = JumpBack;
    trap.manager.emit_message = CountWarnings;
    return &trap.manager;
}

// Runs work on a decoder that has read the header; false when libjpeg gave up. work keeps
// no objects with destructors of its own, since a jump would skip them.
template <typename Work>
bool WithHeader(const Bytes& jpeg, Trap& trap, Work work)
{
    jpeg_decompress_struct codec;
    codec.err = Install(trap);
    if (setjmp(trap.jump)) {
        jpeg_destroy_decompress(&codec);
        return false;
    }
    jpeg_create_decompress(&codec);
    jpeg_mem_src(&codec, jpeg.data(), jpeg.size());
    jpeg_read_header(&codec, TRUE);
    work(codec);
    jpeg_destroy_decompress(&codec);
    return true;
}

void DecodeInto(jpeg_decompress_struct& codec, Picture& out)
{
    codec.out_color_space = JCS_EXT_BGR;
    jpeg_start_decompress(&codec);
    out = Picture{static_cast<int>(codec.output_width), static_cast<int>(codec.output_height), {}};
    out.bgr.resize(static_cast<size_t>(out.width) * out.height * 3);
    while (codec.output_scanline < codec.output_height) {
        JSAMPROW row = out.Pixel(0, static_cast<int>(codec.output_scanline));
        jpeg_read_scanlines(&codec, &row, 1);
    }
    jpeg_finish_decompress(&codec);
}

void ReadInto(jpeg_decompress_struct& codec, Coefficients& out)
{
    jvirt_barray_ptr* arrays = jpeg_read_coefficients(&codec);
    out.blocksWide = static_cast<int>(codec.comp_info[0].width_in_blocks);
    out.blocksHigh = static_cast<int>(codec.comp_info[0].height_in_blocks);
    for (int c = 0; c < 3 && c < codec.num_components; ++c) {
        for (int by = 0; by < out.blocksHigh; ++by) {
            JBLOCKARRAY row = codec.mem->access_virt_barray(reinterpret_cast<j_common_ptr>(&codec), arrays[c],
                                                            static_cast<JDIMENSION>(by), 1, FALSE);
            for (int bx = 0; bx < out.blocksWide; ++bx) {
                out.component[c].emplace_back();
                std::copy(row[0][bx], row[0][bx] + 64, out.component[c].back().begin());
            }
        }
    }
    jpeg_finish_decompress(&codec);
}

template <typename Codec>
void AppendTables(const Codec& codec, std::vector<int>& out)
{
    for (int q = 0; q < 2; ++q)
        out.insert(out.end(), codec.quant_tbl_ptrs[q]->quantval, codec.quant_tbl_ptrs[q]->quantval + 64);
    for (int t = 0; t < 2; ++t) {
        for (const JHUFF_TBL* table : {codec.dc_huff_tbl_ptrs[t], codec.ac_huff_tbl_ptrs[t]}) {
            int count = 0;
            for (int length = 1; length <= 16; ++length) {
                out.push_back(table->bits[length]);
                count += table->bits[length];
            }
            out.insert(out.end(), table->huffval, table->huffval + count);
        }
    }
}

}  // namespace

Picture DecodeJpeg(const Bytes& jpeg, int* warnings)
{
    Trap trap;
    Picture picture;
    if (!WithHeader(jpeg, trap, [&](jpeg_decompress_struct& codec) { DecodeInto(codec, picture); }))
        picture = Picture();
    if (warnings != nullptr)
        *warnings = trap.warnings;
    return picture;
}

Coefficients ReadCoefficients(const Bytes& jpeg)
{
    Trap trap;
    Coefficients coefficients;
    if (!WithHeader(jpeg, trap, [&](jpeg_decompress_struct& codec) { ReadInto(codec, coefficients); }))
        coefficients = Coefficients();
    return coefficients;
}

std::vector<int> TablesOf(const Bytes& jpeg)
{
    Trap trap;
    std::vector<int> tables;
    if (!WithHeader(jpeg, trap, [&](jpeg_decompress_struct& codec) { AppendTables(codec, tables); }))
        tables.clear();
    return tables;
}

std::vector<int> StandardTablesAtHalfScale()
{
    jpeg_compress_struct codec;
    jpeg_error_mgr errors;
    codec.err = jpeg_std_error(&errors);
    jpeg_create_compress(&codec);
    codec.in_color_space = JCS_RGB;
    codec.input_components = 3;
    jpeg_set_defaults(&codec);
    jpeg_set_linear_quality(&codec, 50, TRUE);
    std::vector<int> tables;
    AppendTables(codec, tables);
    jpeg_destroy_compress(&codec);
    return tables;
}

}  // namespace avpost_test
