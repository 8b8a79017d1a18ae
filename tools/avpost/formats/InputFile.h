#ifndef AVPOST_TOOLS_AVPOST_FORMATS_INPUTFILE_H
#define AVPOST_TOOLS_AVPOST_FORMATS_INPUTFILE_H

#include <cstdio>
#include <string>

#include "support/FileHandle.h"
#include "tools/avpost/formats/ByteSource.h"

namespace avpost::tool {

// An input opened for binary reading: a named file, or standard input for "-".
class InputFile : public ByteSource {
public:
    // Throws ToolError naming the path and the system's reason when it cannot be opened.
    explicit InputFile(const std::string& path);

    // The path as given, or "standard input".
    const std::string& name() const override { return name_; }
    size_t Read(void* buffer, size_t count) override;
    // True for regular files.
    bool seekable() const override { return seekable_; }
    long long Tell() const override;
    void SeekTo(long long position) override;
    long long size() const override { return size_; }

private:
    avpost::detail::FileHandle owned_;
    std::FILE* file_ = nullptr;
    std::string name_;
    bool seekable_ = false;
    long long size_ = 0;
};

// True when a path names standard input or output.
inline bool IsStandardStream(const std::string& path) { return path == "-"; }

}  // namespace avpost::tool

#endif
