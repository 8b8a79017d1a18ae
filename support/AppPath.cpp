#include "support/AppPath.h"

#include <unistd.h>

#include <climits>
#include <cstring>
#include <string>

namespace {

constexpr size_t kPathBytes = 512;

// The directory part of the executable's resolved path, or an empty string.
std::string ExecutableDirectory()
{
    char exe[PATH_MAX];
    const ssize_t length = readlink("/proc/self/exe", exe, sizeof(exe) - 1);
    if (length <= 0)
        return std::string();
    const std::string file(exe, static_cast<size_t>(length));
    const size_t slash = file.rfind('/');
    if (slash == std::string::npos)
        return std::string();
    // An executable in the root directory yields "", which still joins as "/name".
    return file.substr(0, slash);
}

}  // namespace

void GetAppPathA(char* path, int size)
{
    if (path == nullptr)
        return;
    const size_t limit = size > 0 && static_cast<size_t>(size) < kPathBytes ? static_cast<size_t>(size) : kPathBytes;
    const std::string directory = ExecutableDirectory();
    // A truncated directory would name some other place: give nothing instead.
    if (directory.size() >= limit) {
        path[0] = '\0';
        return;
    }
    std::memcpy(path, directory.c_str(), directory.size() + 1);
}

int replace_str_2_char(char* text, const char* pattern, char replacement)
{
    if (text == nullptr || pattern == nullptr || pattern[0] == '\0')
        return 0;
    const size_t patternLength = std::strlen(pattern);
    int count = 0;
    char* write = text;
    const char* read = text;
    while (*read != '\0') {
        if (std::strncmp(read, pattern, patternLength) == 0) {
            *write = replacement;
            read += patternLength;
            ++count;
        } else {
            if (write != read)
                *write = *read;
            ++read;
        }
        ++write;
    }
    *write = '\0';
    return count;
}
