#include "image/output/IjlLoader.h"

#include <dlfcn.h>
#include <unistd.h>

#include <climits>
#include <cstdlib>

#include "image/output/IjlObj.h"

namespace {

constexpr char kLibraryName[] = "IJL15.DLL";

std::string DirectoryOf(const std::string& file)
{
    const size_t slash = file.rfind('/');
    return slash == std::string::npos ? std::string() : file.substr(0, slash + 1);
}

// The file that holds this code: libavpost.so, or the program when the code is linked in
// (the loader may then name it as it was started, relative to the starting directory).
std::string ThisModuleFile()
{
    Dl_info info{};
    char path[PATH_MAX];
    if (dladdr(reinterpret_cast<void*>(&GetIjlObj), &info) == 0 || info.dli_fname == nullptr ||
        realpath(info.dli_fname, path) == nullptr)
        return std::string();
    return path;
}

std::string RunningProgramFile()
{
    char path[PATH_MAX];
    const ssize_t length = readlink("/proc/self/exe", path, sizeof path - 1);
    return length > 0 ? std::string(path, static_cast<size_t>(length)) : std::string();
}

template <typename Entry>
bool LookUp(void* handle, const char* name, Entry& entry)
{
    entry = reinterpret_cast<Entry>(dlsym(handle, name));
    return entry != nullptr;
}

}  // namespace

namespace avpost::detail {

std::vector<std::string> IjlLibraryCandidates()
{
    std::vector<std::string> candidates;
    for (const std::string& directory : {DirectoryOf(ThisModuleFile()), DirectoryOf(RunningProgramFile())}) {
        const std::string file = directory + kLibraryName;
        if (!directory.empty() && (candidates.empty() || candidates.back() != file))
            candidates.push_back(file);
    }
    candidates.push_back(kLibraryName);
    return candidates;
}

bool LoadIjlLibrary(CIjlObj& obj, const char* file)
{
    // A null name would open the program itself.
    void* handle = file != nullptr ? dlopen(file, RTLD_NOW | RTLD_LOCAL) : nullptr;
    if (handle == nullptr)
        return false;
    CIjlObj loaded;
    loaded.handle = handle;
    if (!LookUp(handle, "ijlInit", loaded.ijlInit) || !LookUp(handle, "ijlFree", loaded.ijlFree) ||
        !LookUp(handle, "ijlRead", loaded.ijlRead) || !LookUp(handle, "ijlWrite", loaded.ijlWrite)) {
        dlclose(handle);
        return false;
    }
    obj = loaded;
    return true;
}

void UnloadIjlLibrary(CIjlObj& obj)
{
    if (obj.handle != nullptr)
        dlclose(obj.handle);
    obj = CIjlObj();
}

}  // namespace avpost::detail
