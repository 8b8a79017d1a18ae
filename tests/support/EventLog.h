#ifndef AVPOST_TESTS_SUPPORT_EVENTLOG_H
#define AVPOST_TESTS_SUPPORT_EVENTLOG_H

#include <dlfcn.h>

#include <string>
#include <vector>

#include "support/Log.h"

// Reads back what the test logging library (tests/support/EventLogLibrary.cpp, copied next to
// the test executable as "event.dylib") has received through its "Log" entry.
namespace eventlog {

template <typename Function>
Function Entry(const char* name)
{
    void* handle = dyLogInit();
    return handle != nullptr ? reinterpret_cast<Function>(dlsym(handle, name)) : nullptr;
}

inline bool Loaded()
{
    return dyLogInit() != nullptr;
}

inline std::vector<std::wstring> Messages()
{
    std::vector<std::wstring> messages;
    const auto count = Entry<int (*)()>("RecordedLogCount");
    const auto message = Entry<const wchar_t* (*)(int)>("RecordedLogMessage");
    if (count == nullptr || message == nullptr)
        return messages;
    for (int i = 0; i < count(); ++i)
        messages.emplace_back(message(i));
    return messages;
}

inline void Clear()
{
    if (const auto clear = Entry<void (*)()>("ClearRecordedLog"))
        clear();
}

}  // namespace eventlog

#endif
