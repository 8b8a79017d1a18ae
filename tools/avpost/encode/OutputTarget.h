#ifndef AVPOST_TOOLS_AVPOST_ENCODE_OUTPUTTARGET_H
#define AVPOST_TOOLS_AVPOST_ENCODE_OUTPUTTARGET_H

#include <memory>
#include <string>

extern "C" {
#include <libavformat/avio.h>
}

#include "tools/avpost/output/OutputFile.h"

namespace avpost::tool {

// Where a muxer writes: a named file, which appears only when complete (written under a
// temporary name, put in place by Commit, removed otherwise); a device or pipe written
// directly (/dev/null, a FIFO); or standard output for "-".
class OutputTarget {
public:
    // Creates what is written to; throws ToolError naming the output when it cannot.
    explicit OutputTarget(const std::string& path);
    ~OutputTarget();
    OutputTarget(const OutputTarget&) = delete;
    OutputTarget& operator=(const OutputTarget&) = delete;

    AVIOContext* io() const { return io_; }
    // The path as given, or "standard output".
    const std::string& name() const { return name_; }
    // Where what was written can be read back (the temporary file); empty when it cannot.
    std::string readBack() const { return staged_ ? staged_->temporary() : ""; }
    // False for standard output and pipes: a muxer can only write on, never go back.
    bool seekable() const;

    // Flushes and closes; throws ToolError on a write error, Interrupted when the reader of a
    // pipe went away.
    void Close();
    // Puts a named file in place; after Close.
    void Commit();

private:
    std::string name_;
    std::unique_ptr<StagedPath> staged_;
    AVIOContext* io_ = nullptr;
};

// Throws what a failed write into the output means: Interrupted when the reader of a pipe
// went away, else ToolError "name: write error: reason".
[[noreturn]] void FailToWrite(const std::string& name, int code);

}  // namespace avpost::tool

#endif
