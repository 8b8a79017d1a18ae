#ifndef AVPOST_SUPPORT_FILEHANDLE_H
#define AVPOST_SUPPORT_FILEHANDLE_H

#include <cstdio>
#include <memory>

namespace avpost::detail {

struct FileCloser {
    void operator()(std::FILE* file) const { std::fclose(file); }
};

// A C stream closed on every path out of its scope. A writer must close it with CloseFile
// instead, because only fclose's result says whether the buffered bytes reached the file.
using FileHandle = std::unique_ptr<std::FILE, FileCloser>;

inline FileHandle OpenFile(const char* path, const char* mode) { return FileHandle(std::fopen(path, mode)); }

// Closes the stream now: 0 when it and everything buffered were written, EOF otherwise.
// Closing an empty handle does nothing and succeeds.
inline int CloseFile(FileHandle& file) { return file ? std::fclose(file.release()) : 0; }

}  // namespace avpost::detail

#endif
