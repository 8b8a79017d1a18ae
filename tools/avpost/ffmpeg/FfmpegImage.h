#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGIMAGE_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGIMAGE_H

#include <string>

#include "tools/avpost/formats/Bmp.h"

namespace avpost::tool {

// Reads the first picture of an image (JPEG, PNG, ...) or video file through FFmpeg,
// keeping its alpha where it has one. Throws ToolError naming the file.
Bitmap32 LoadImageWithFfmpeg(const std::string& path);

}  // namespace avpost::tool

#endif
