#ifndef AVPOST_FUZZ_SCRATCHFILE_H
#define AVPOST_FUZZ_SCRATCHFILE_H

#include <stdlib.h>
#include <unistd.h>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <string>

#include "support/FileHandle.h"

// A folder of this process for the files a target hands to code that reads files, made on first
// use and removed at exit.
class ScratchFolder {
public:
    static const ScratchFolder& Get()
    {
        static const ScratchFolder folder;
        return folder;
    }
    std::string File(const char* name) const { return path_ + "/" + name; }

    // Writes the bytes to a file of the folder and returns its path.
    std::string Write(const char* name, const uint8_t* data, size_t size) const
    {
        const std::string path = File(name);
        auto file = avpost::detail::OpenFile(path.c_str(), "wb");
        if (!file || (size != 0 && std::fwrite(data, 1, size, file.get()) != size) ||
            avpost::detail::CloseFile(file) != 0)
            std::abort();
        return path;
    }

private:
    ScratchFolder()
    {
        char name[] = "/tmp/avpost-fuzz-XXXXXX";
        if (mkdtemp(name) == nullptr)
            std::abort();
        path_ = name;
    }
    ~ScratchFolder() { rmdir(path_.c_str()); }

    std::string path_;
};

#endif
