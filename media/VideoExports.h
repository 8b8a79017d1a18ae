#ifndef AVPOST_MEDIA_VIDEOEXPORTS_H
#define AVPOST_MEDIA_VIDEOEXPORTS_H

#include "../video/VideoProcess.h"
#include "AvpostApi.h"
#include "Decoder.h"
#include "WinTypes.h"

// Flat functions a host uses to create, seek and destroy video stages. Every function
// accepts a null stage and then does nothing (returning null where it returns a value).

// A constant-frame-rate stage over an opened source; null when source is null or when
// no positive frame rate results (frameRate <= 0 and the source reports none).
AVPOST_API VideoDecoder* PEVideoCreate(VideoDecoder* source, double frameRate);
AVPOST_API void PEVideoDestroy(VideoDecoder* stage);

extern "C" {
// A VideoProcess over an opened source (see VideoProcess); null for a null source or one
// without stream information. request may be null.
AVPOST_API VideoDecoder* PCVideoInit(VideoDecoder* source, const RESIZE_PARAM* request, double frameRate,
                                     bool keepLastFrame);
// Destroys any video stage; the source it wraps stays with the host.
AVPOST_API void PCVideoRelease(VideoDecoder* stage);
// Seeks any video stage; the time reached is discarded.
AVPOST_API void PCVideoSeek(VideoDecoder* stage, double seconds, unsigned flags);

// Settings of a stage made by PCVideoInit; any other kind of stage is ignored. The next picture
// uses them; which of them take the stage's lock is said in media/Decoder.h.
AVPOST_API void PCSetVideoBrightness(VideoDecoder* stage, int value);
AVPOST_API void PCSetContrast(VideoDecoder* stage, int value);
AVPOST_API void PCSetVideoSaturation(VideoDecoder* stage, int value);
AVPOST_API void PCSetVideoDeintelace(VideoDecoder* stage, DEINTERLACE_STYLE style);
// Bit 0 mirrors left to right, bit 1 upside down.
AVPOST_API void PCSetFlipFlag(VideoDecoder* stage, unsigned flags);
// Bits 0...5: gray, emboss, negative, black-white, white-black, old photo.
AVPOST_API void PCSetExFilterFlag(VideoDecoder* stage, unsigned flags);
AVPOST_API void PCSetCropRect(VideoDecoder* stage, const tagRECT* rect);
// Hides the fixed watermark (nonzero) or shows it again (0) without setting its picture anew.
AVPOST_API void PCDisableWatermark(VideoDecoder* stage, unsigned disable);

// Watermarks of a stage made by PCVideoInit (see VideoProcess): the fixed watermark by
// rectangle or alignment code, the user watermark by fractions of the output size
// (conversionFlag != 0: a 32-bit bitmap stored bottom-up). The SrcID forms have no effect.
AVPOST_API void PCSetWatermarkImage(VideoDecoder* stage, tagBITMAPINFO* bitmap, unsigned char* bits, tagRECT* rect,
                                    int level);
AVPOST_API void PCSetWatermarkImageAlign(VideoDecoder* stage, tagBITMAPINFO* bitmap, unsigned char* bits, int align,
                                         int level);
AVPOST_API void PCSetUserWatermarkImage(VideoDecoder* stage, tagBITMAPINFO* bitmap, unsigned char* bits, tagFRECT* rect,
                                        int level, int conversionFlag);
AVPOST_API void PCSetWatermarkSrcID(VideoDecoder* stage, void* module, const wchar_t* id, tagRECT* rect, int level);
AVPOST_API void PCSetWatermarkSrcIDAlign(VideoDecoder* stage, void* module, const wchar_t* id, int align, int level);

// Writes the stage's current picture as BMP (jpeg = 0) or JPEG; 1 when written, 0 otherwise
// (also for a null stage).
AVPOST_API int PCCaptureImage(VideoDecoder* stage, wchar_t* path, int jpeg, unsigned reserved);
}

#endif
