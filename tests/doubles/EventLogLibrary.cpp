// The logging library the library under test loads at run time ("event.dylib" next to the test
// executable): it records every message its "Log" entry receives, for the tests to read back.
#include <cwchar>
#include <string>
#include <vector>

extern "C" {

__attribute__((visibility("default"))) std::vector<std::wstring>* RecordedLog()
{
    static std::vector<std::wstring> messages;
    return &messages;
}

// Returns something a caller can recognise as coming from here.
__attribute__((visibility("default"))) int Log(const wchar_t* text)
{
    RecordedLog()->emplace_back(text);
    return static_cast<int>(std::wcslen(text)) + 1000;
}
}
