#include "tools/avpost/common/Utf8.h"

#include <cwchar>
#include <vector>

#include "support/TextEncoding.h"
#include "tools/avpost/common/ToolError.h"

namespace avpost::tool {
namespace {

bool IsContinuation(unsigned char byte) { return (byte & 0xC0) == 0x80; }

// Length of the sequence a lead byte starts, and the bits it contributes; 0 for a bad lead.
int SequenceLength(unsigned char lead, char32_t& bits)
{
    if (lead < 0x80) {
        bits = lead;
        return 1;
    }
    if ((lead & 0xE0) == 0xC0) {
        bits = lead & 0x1F;
        return 2;
    }
    if ((lead & 0xF0) == 0xE0) {
        bits = lead & 0x0F;
        return 3;
    }
    if ((lead & 0xF8) == 0xF0) {
        bits = lead & 0x07;
        return 4;
    }
    return 0;
}

bool IsValidCodePoint(char32_t code, int length)
{
    static const char32_t kSmallest[] = {0, 0, 0x80, 0x800, 0x10000};
    return code >= kSmallest[length] && code <= 0x10FFFF && (code < 0xD800 || code > 0xDFFF);
}

}  // namespace

std::wstring WideFromUtf8(const std::string& text)
{
    std::wstring wide;
    for (size_t i = 0; i < text.size();) {
        char32_t code = 0;
        const int length = SequenceLength(static_cast<unsigned char>(text[i]), code);
        if (length == 0 || i + static_cast<size_t>(length) > text.size())
            Fail(text, "is not valid UTF-8");
        for (int k = 1; k < length; ++k) {
            const unsigned char next = static_cast<unsigned char>(text[i + static_cast<size_t>(k)]);
            if (!IsContinuation(next))
                Fail(text, "is not valid UTF-8");
            code = code << 6 | (next & 0x3F);
        }
        if (!IsValidCodePoint(code, length))
            Fail(text, "is not valid UTF-8");
        wide += static_cast<wchar_t>(code);
        i += static_cast<size_t>(length);
    }
    return wide;
}

std::string Utf8FromWide(const wchar_t* text)
{
    if (text == nullptr)
        return {};
    // At most four bytes per character, and the terminator.
    std::vector<char> buffer(std::wcslen(text) * 4 + 1, '\0');
    WtoUTF8(text, -1, buffer.data(), static_cast<int>(buffer.size()), false);
    return buffer.data();
}

}  // namespace avpost::tool
