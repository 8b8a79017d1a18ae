#ifndef AVPOST_IMAGE_OUTPUT_SAVEYUVIMAGE_H
#define AVPOST_IMAGE_OUTPUT_SAVEYUVIMAGE_H

#include <cwchar>

#include "../../media/AvpostApi.h"

// Writes a planar YUV 4:2:0 picture as a 24-bit BMP file (jpeg = 0) or as a baseline JPEG file
// (jpeg != 0, encoded from a temporary bitmap named path + ".tmp~yuv~2~rgb~temp.bmp" that is
// removed afterwards). Returns 1 when the bitmap was written, 0 otherwise. In JPEG mode a
// name whose UTF-8 form leaves no room for the temporary name in 511 bytes is refused (0,
// nothing written); a BMP name longer than 511 bytes is cut after the last whole character.
AVPOST_API int SaveYUVImage(const wchar_t* path, int jpeg, int width, int height, unsigned char* y, unsigned char* u,
                            unsigned char* v, int pitchY, int pitchU, int pitchV);

#endif
