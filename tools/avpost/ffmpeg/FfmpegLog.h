#ifndef AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGLOG_H
#define AVPOST_TOOLS_AVPOST_FFMPEG_FFMPEGLOG_H

#include <string>

namespace avpost::tool {

// The tool reports problems itself, one line each, and FFmpeg's own chatter would break its
// progress line and pipes. Once this has run, FFmpeg's libraries print nothing; the last
// error they reported is kept, so that a failure can say why an encoder refused its settings.
void QuietFfmpegLog();

// FFmpeg's last error message (one line, without its source's name), or empty; reading it
// clears it.
std::string TakeFfmpegMessage();

}  // namespace avpost::tool

#endif
