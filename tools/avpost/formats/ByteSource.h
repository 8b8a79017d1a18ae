#ifndef AVPOST_TOOLS_AVPOST_FORMATS_BYTESOURCE_H
#define AVPOST_TOOLS_AVPOST_FORMATS_BYTESOURCE_H

#include <cstddef>
#include <string>

namespace avpost::tool {

// Where the tool's readers take their bytes from: a file, standard input, or memory (tests,
// and any caller holding the bytes already). Errors are ToolError naming the input.
class ByteSource {
public:
    virtual ~ByteSource() = default;

    // How messages name the input.
    virtual const std::string& name() const = 0;
    // Reads up to count bytes; fewer only at the end of the input.
    virtual size_t Read(void* buffer, size_t count) = 0;
    // True when the position can be told and moved back.
    virtual bool seekable() const = 0;
    virtual long long Tell() const = 0;
    virtual void SeekTo(long long position) = 0;
    // Size in bytes when known, else 0.
    virtual long long size() const = 0;

    // Reads exactly count bytes. Returns false when the input ended before the first byte and
    // throws ToolError ("truncated <what>") when it ended part-way.
    bool ReadExactly(void* buffer, size_t count, const std::string& what);
};

// Bytes held in memory; the source refers to them and does not copy.
class MemoryBytes : public ByteSource {
public:
    MemoryBytes(const void* data, size_t size, std::string name = "input");

    const std::string& name() const override { return name_; }
    size_t Read(void* buffer, size_t count) override;
    bool seekable() const override { return true; }
    long long Tell() const override { return static_cast<long long>(at_); }
    void SeekTo(long long position) override;
    long long size() const override { return static_cast<long long>(size_); }

private:
    const unsigned char* data_;
    size_t size_;
    size_t at_ = 0;
    std::string name_;
};

}  // namespace avpost::tool

#endif
