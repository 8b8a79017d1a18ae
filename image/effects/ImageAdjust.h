#ifndef AVPOST_IMAGE_EFFECTS_IMAGEADJUST_H
#define AVPOST_IMAGE_EFFECTS_IMAGEADJUST_H

#include "../../media/AvpostApi.h"
#include "../../media/MediaFrame.h"

// Brightness, contrast and saturation of a planar YUV 4:2:0 picture in studio range, worked in
// place on Y, U and V directly. Strengths are percentages of any sign; a strength of 0 leaves the
// planes untouched, not even clamped. Results are clamped to luma 16...235 and chroma 16...240.
// Each plane is walked with its own pitch; a null plane that a function needs, or an empty
// picture, makes it do nothing.

// Adds the strength to every luma sample; chroma is not touched.
AVPOST_API void AdjustBrightness(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                                 int nPitchV, int nWidth, int nHeight, int nBrightness);
// Stretches luma and all (width + 1) / 2 x (height + 1) / 2 chroma samples about 128.
AVPOST_API void AdjustContrast(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                               int nPitchV, int nWidth, int nHeight, int nContrast);
// Stretches chroma about 128; a positive strength counts three times. Only the
// width / 2 x height / 2 chroma samples that cover two full luma rows and columns are changed.
AVPOST_API void AdjustSaturation(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                                 int nPitchV, int nWidth, int nHeight, int nSaturation);
// Brightness, then contrast, then saturation, each skipped when its strength is 0.
AVPOST_API void AdjustImage(unsigned char* pY, unsigned char* pU, unsigned char* pV, int nPitchY, int nPitchU,
                            int nPitchV, int nWidth, int nHeight, int nBrightness, int nContrast, int nSaturation);
// The same on a frame whose planes are packed (its pitch fields are not read). A null frame is ignored.
AVPOST_API void AdjustImage(MEDIA_FRAME* frame, int nBrightness, int nContrast, int nSaturation);

#endif
