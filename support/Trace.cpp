#include "support/Trace.h"

#include <cstdarg>
#include <cstdio>
#include <mutex>
#include <string>

#include "support/TraceLine.h"

namespace {

struct Sink {
    AvpostTraceCallback callback = nullptr;
    void* context = nullptr;
};

std::mutex sinkLock;
Sink sink;

Sink CurrentSink()
{
    const std::lock_guard<std::mutex> hold(sinkLock);
    return sink;
}

std::string Formatted(const char* format, va_list args)
{
    va_list measure;
    va_copy(measure, args);
    const int length = std::vsnprintf(nullptr, 0, format, measure);
    va_end(measure);
    if (length <= 0)
        return {};
    std::string text(static_cast<size_t>(length) + 1, '\0');
    std::vsnprintf(text.data(), text.size(), format, args);
    text.pop_back();
    return text;
}

}  // namespace

void PCSetTraceCallback(AvpostTraceCallback callback, void* context)
{
    const std::lock_guard<std::mutex> hold(sinkLock);
    sink = Sink{callback, callback != nullptr ? context : nullptr};
}

void avpost::detail::TraceLine(const char* format, ...)
{
    va_list args;
    va_start(args, format);
    const std::string line = Formatted(format, args);
    va_end(args);
    const Sink target = CurrentSink();
    if (target.callback != nullptr) {
        target.callback(line.c_str(), target.context);
        return;
    }
    std::fputs(line.c_str(), stdout);
    std::fflush(stdout);
}
