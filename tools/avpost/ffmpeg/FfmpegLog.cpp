#include "tools/avpost/ffmpeg/FfmpegLog.h"

#include <cstdarg>
#include <cstdio>
#include <mutex>

extern "C" {
#include <libavutil/log.h>
}

namespace avpost::tool {
namespace {

std::mutex g_lock;
std::string g_message;

// Called on FFmpeg's threads too.
void KeepMessage(void*, int level, const char* format, va_list arguments)
{
    if (level > AV_LOG_ERROR)
        return;
    char text[512];
    std::vsnprintf(text, sizeof(text), format, arguments);
    std::string message = text;
    while (!message.empty() && (message.back() == '\n' || message.back() == ' '))
        message.pop_back();
    if (message.empty())
        return;
    const std::lock_guard<std::mutex> hold(g_lock);
    g_message = message;
}

}  // namespace

void QuietFfmpegLog()
{
    av_log_set_level(AV_LOG_ERROR);
    av_log_set_callback(KeepMessage);
}

std::string TakeFfmpegMessage()
{
    const std::lock_guard<std::mutex> hold(g_lock);
    std::string message;
    message.swap(g_message);
    return message;
}

}  // namespace avpost::tool
