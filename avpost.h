#ifndef AVPOST_AVPOST_H
#define AVPOST_AVPOST_H

// Everything a host needs: the media model, the stages, the exported functions and the
// image, audio and output functions.

#include "media/AvpostApi.h"
#include "media/WinTypes.h"
#include "media/MediaFrame.h"
#include "media/StreamInfo.h"
#include "media/Decoder.h"
#include "media/VideoExports.h"
#include "video/VideoEvenProcess.h"
#include "image/effects/ImageAdjust.h"
#include "image/effects/ImageFilter.h"
#include "image/effects/Deinterlace.h"
#include "image/effects/WaterMark.h"
#include "image/resize/ImgParam.h"
#include "image/resize/ImageResize.h"
#include "image/resize/DibResizeKernels.h"
#include "image/resize/LumaResizeKernels.h"
#include "image/resize/ChromaResizeKernels.h"
#include "image/resize/AveragingResizeKernel.h"
#include "image/resize/BicubicResizeKernel.h"
#include "image/resize/AlphaMaskResizeKernels.h"
#include "image/resize/ResizeGeometry.h"
#include "image/resize/YuvFrameResize.h"
#include "Common/Image/ImageConvert.h"
#include "image/output/DibImage.h"
#include "image/output/JpegEncoder.h"
#include "image/output/JpegCoreProperties.h"
#include "image/output/IjlObj.h"
#include "support/TextEncoding.h"

#endif
