#ifndef AVPOST_TESTS_DOUBLES_EVENTLOG_H
#define AVPOST_TESTS_DOUBLES_EVENTLOG_H

#include <dlfcn.h>

#include <string>
#include <vector>

#include "support/Log.h"

// The messages the test logging library (EventLogLibrary.cpp, copied next to the test executable
// as "event.dylib") has received, emptied; null when no library was loaded.
inline std::vector<std::wstring>* ClearedEventLog()
{
    void* const library = dyLogInit();
    if (library == nullptr)
        return nullptr;
    auto* const log = reinterpret_cast<std::vector<std::wstring>* (*)()>(dlsym(library, "RecordedLog"))();
    log->clear();
    return log;
}

#endif
