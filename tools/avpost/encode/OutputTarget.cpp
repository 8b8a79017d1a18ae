#include "tools/avpost/encode/OutputTarget.h"

#include <csignal>
#include <cstdio>

#include "tools/avpost/common/Interruption.h"
#include "tools/avpost/common/ToolError.h"
#include "tools/avpost/ffmpeg/FfmpegInput.h"
#include "tools/avpost/formats/InputFile.h"

namespace avpost::tool {

void FailToWrite(const std::string& name, int code)
{
    if (code == AVERROR(EPIPE)) {
        NoteBrokenPipe();
        throw Interrupted(SIGPIPE);
    }
    if (code == AVERROR_EXIT && PendingInterruption() != 0)
        throw Interrupted(PendingInterruption());
    Fail(name, "write error: " + FfmpegErrorText(code));
}

OutputTarget::OutputTarget(const std::string& path)
{
    std::string url;
    if (IsStandardStream(path)) {
        name_ = "standard output";
        std::fflush(stdout);
        url = "pipe:" + std::to_string(fileno(stdout));
    } else {
        name_ = path;
        // Devices and pipes cannot be replaced by a finished file: they are written directly.
        if (!IsDevice(path))
            staged_ = std::make_unique<StagedPath>(path);
        url = "file:" + (staged_ ? staged_->temporary() : path);
    }
    // A signal that asks the tool to stop also ends a write that waits for a slow reader.
    const AVIOInterruptCB interrupt{[](void*) { return PendingInterruption() != 0 ? 1 : 0; }, nullptr};
    const int code = avio_open2(&io_, url.c_str(), AVIO_FLAG_WRITE, &interrupt, nullptr);
    if (code < 0)
        Fail(name_, "cannot create: " + FfmpegErrorText(code));
}

OutputTarget::~OutputTarget() { avio_closep(&io_); }

bool OutputTarget::seekable() const { return io_ != nullptr && (io_->seekable & AVIO_SEEKABLE_NORMAL) != 0; }

void OutputTarget::Close()
{
    avio_flush(io_);
    const int error = io_->error;
    const int code = avio_closep(&io_);
    if (error < 0 || code < 0)
        FailToWrite(name_, error < 0 ? error : code);
}

void OutputTarget::Commit()
{
    if (staged_)
        staged_->Commit();
}

}  // namespace avpost::tool
