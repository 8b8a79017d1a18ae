// The logging library the library under test loads at run time ("event.dylib" next to the test
// executable). It keeps every message its "Log" entry receives, for the tests to read back.
#include <cwchar>
#include <string>
#include <vector>

namespace {

std::vector<std::wstring>& Messages()
{
    static std::vector<std::wstring> messages;
    return messages;
}

}  // namespace

extern "C" {

__attribute__((visibility("default"))) int Log(const wchar_t* text)
{
    Messages().emplace_back(text);
    // Something a caller can recognise as coming from here.
    return static_cast<int>(std::wcslen(text)) + 1000;
}

__attribute__((visibility("default"))) int RecordedLogCount()
{
    return static_cast<int>(Messages().size());
}

__attribute__((visibility("default"))) const wchar_t* RecordedLogMessage(int index)
{
    return Messages()[static_cast<size_t>(index)].c_str();
}

__attribute__((visibility("default"))) void ClearRecordedLog()
{
    Messages().clear();
}
}
