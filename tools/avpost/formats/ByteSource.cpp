#include "tools/avpost/formats/ByteSource.h"

#include <algorithm>
#include <cstring>

#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {

bool ByteSource::ReadExactly(void* buffer, size_t count, const std::string& what)
{
    const size_t got = Read(buffer, count);
    if (got == count)
        return true;
    if (got == 0)
        return false;
    Fail(name(), "truncated " + what + " (" + std::to_string(got) + " of " + std::to_string(count) + " bytes)");
}

MemoryBytes::MemoryBytes(const void* data, size_t size, std::string name)
    : data_(static_cast<const unsigned char*>(data)), size_(size), name_(std::move(name))
{
}

size_t MemoryBytes::Read(void* buffer, size_t count)
{
    const size_t got = std::min(count, size_ - at_);
    if (got != 0)
        std::memcpy(buffer, data_ + at_, got);
    at_ += got;
    return got;
}

void MemoryBytes::SeekTo(long long position)
{
    if (position < 0 || position > static_cast<long long>(size_))
        Fail(name_, "cannot seek");
    at_ = static_cast<size_t>(position);
}

}  // namespace avpost::tool
