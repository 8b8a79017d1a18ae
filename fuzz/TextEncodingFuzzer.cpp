// Wide file names to UTF-8: any 32-bit values (surrogates, values past U+10FFFF), any length and
// any destination size, strict or lenient. The destination is exactly as large as announced, so
// a write past it is caught.
#include <algorithm>
#include <cstdint>
#include <string>
#include <vector>

#include "FuzzInput.h"
#include "FuzzSeeds.h"
#include "support/TextEncoding.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    FuzzInput input(data, size);
    const int bufferSize = input.InRange(0, 64);
    const bool strict = input.Flag();
    const int length = input.InRange(-2, 32);
    std::vector<wchar_t> text;
    while (!input.Empty())
        text.push_back(input.Take<wchar_t>());
    text.push_back(L'\0');

    std::vector<char> buffer(static_cast<size_t>(bufferSize));
    const int usable = length < 0 ? length : std::min<int>(length, static_cast<int>(text.size()));
    WtoUTF8(text.data(), usable, buffer.empty() ? nullptr : buffer.data(), bufferSize, strict);

    std::vector<unsigned long> points(text.begin(), text.end());
    std::vector<unsigned char> bytes(static_cast<size_t>(bufferSize));
    ConvertUTF32toUTF8(points.data(), points.data() + points.size(), bytes.data(), bytes.data() + bytes.size(),
                       strict ? ConversionFlags::Strict : ConversionFlags::Lenient);
    return 0;
}

std::vector<std::vector<uint8_t>> FuzzSeeds()
{
    FuzzOutput name;
    name.PutInRange(32, 0).Put<uint8_t>(1).PutInRange(-1, -2);
    for (wchar_t c : std::wstring(L"caf\u00e9 \u65e5\u672c \U0001F3A5.jpg"))
        name.Put(c);
    FuzzOutput tight;
    tight.PutInRange(3, 0).Put<uint8_t>(0).PutInRange(2, -2).Put<wchar_t>(0xD800).Put<wchar_t>(0x110000);
    return {name.bytes(), tight.bytes()};
}
