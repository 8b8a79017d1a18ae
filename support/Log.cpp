#include "support/Log.h"

#include <dlfcn.h>

#include <cinttypes>
#include <cstdarg>
#include <cstdint>
#include <cwchar>
#include <string>

#include "support/AppPath.h"
#include "support/TraceLine.h"

namespace {

constexpr int kPathBytes = 512;
constexpr size_t kMessageChars = 1024;
constexpr uintptr_t kHighestEntryNumber = 65535;
constexpr char kLibraryName[] = "event.dylib";
constexpr char kEntryName[] = "Log";

using LogEntry = int (*)(const wchar_t*);

void* LoadLogLibrary()
{
    char directory[kPathBytes] = {};
    GetAppPathA(directory, kPathBytes - 1);
    const std::string file = std::string(directory) + "/" + kLibraryName;

    // Without a known directory the name would be looked up in places nobody chose.
    void* handle = nullptr;
    if (directory[0] != '\0' && file.size() < static_cast<size_t>(kPathBytes))
        handle = dlopen(file.c_str(), RTLD_LAZY);
    if (handle == nullptr)
        avpost::detail::TraceLine("dyLog: dlopen [%s] error.\r\n", file.c_str());
    return handle;
}

}  // namespace

void* dyLogInit()
{
    static void* const hLogHandle = LoadLogLibrary();
    return hLogHandle;
}

void* LogGetAddress(const char* name)
{
    void* const handle = dyLogInit();
    const uintptr_t nameValue = reinterpret_cast<uintptr_t>(name);
    const bool byName = nameValue > kHighestEntryNumber;
    // dlsym with a null handle would search the whole process, so a failed load finds nothing.
    void* const entry = handle != nullptr && byName ? dlsym(handle, name) : nullptr;
    if (entry != nullptr)
        return entry;
    const uintptr_t handleValue = reinterpret_cast<uintptr_t>(handle);
    if (byName)
        avpost::detail::TraceLine("dyLog: LogGetAddress [%s] [0x%" PRIxPTR "] error.\r\n", name, handleValue);
    else
        avpost::detail::TraceLine("dyLog: LogGetAddress [%d] [0x%" PRIxPTR "] error.\r\n", static_cast<int>(nameValue),
                                  handleValue);
    return nullptr;
}

int LogEx(const wchar_t* format, ...)
{
    if (format == nullptr)
        return 0;
    wchar_t text[kMessageChars] = {};
    va_list args;
    va_start(args, format);
    const int written = std::vswprintf(text, kMessageChars, format, args);
    va_end(args);
    if (written == 0)
        return 0;
    // A message that did not fit is passed on cut, always terminated.
    text[kMessageChars - 1] = L'\0';

    const auto entry = reinterpret_cast<LogEntry>(LogGetAddress(kEntryName));
    return entry != nullptr ? entry(text) : 0;
}
