#ifndef AVPOST_TOOLS_AVPOST_INPUTFILE_H
#define AVPOST_TOOLS_AVPOST_INPUTFILE_H

#include <cstddef>
#include <cstdio>
#include <memory>
#include <string>

namespace avpost::tool {

// An input opened for binary reading: a named file, or standard input for "-".
class InputFile {
public:
    // Throws ToolError naming the path and the system's reason when it cannot be opened.
    explicit InputFile(const std::string& path);

    std::FILE* get() const { return file_; }
    // The path as given, or "standard input".
    const std::string& name() const { return name_; }
    // True for regular files, whose position can be moved back.
    bool seekable() const { return seekable_; }
    // Size in bytes of a regular file; 0 otherwise.
    long long size() const { return size_; }

    // Reads up to count bytes; returns how many arrived before the end of the input.
    size_t Read(void* buffer, size_t count);
    // Reads exactly count bytes. Returns false when the input ended before the first byte and
    // throws ToolError ("truncated <what>") when it ended part-way.
    bool ReadExactly(void* buffer, size_t count, const std::string& what);

private:
    struct Closer {
        void operator()(std::FILE* file) const { std::fclose(file); }
    };
    std::unique_ptr<std::FILE, Closer> owned_;
    std::FILE* file_ = nullptr;
    std::string name_;
    bool seekable_ = false;
    long long size_ = 0;
};

// True when a path names standard input or output.
inline bool IsStandardStream(const std::string& path)
{
    return path == "-";
}

}  // namespace avpost::tool

#endif
