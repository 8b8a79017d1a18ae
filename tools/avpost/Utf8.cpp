#include "tools/avpost/Utf8.h"

#include "tools/avpost/ToolError.h"

namespace avpost::tool {
namespace {

constexpr char32_t kReplacement = 0xFFFD;

bool IsContinuation(unsigned char byte)
{
    return (byte & 0xC0) == 0x80;
}

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

void Append(std::string& out, char32_t code)
{
    if (code < 0x80) {
        out += static_cast<char>(code);
    } else if (code < 0x800) {
        out += static_cast<char>(0xC0 | code >> 6);
        out += static_cast<char>(0x80 | (code & 0x3F));
    } else if (code < 0x10000) {
        out += static_cast<char>(0xE0 | code >> 12);
        out += static_cast<char>(0x80 | (code >> 6 & 0x3F));
        out += static_cast<char>(0x80 | (code & 0x3F));
    } else {
        out += static_cast<char>(0xF0 | code >> 18);
        out += static_cast<char>(0x80 | (code >> 12 & 0x3F));
        out += static_cast<char>(0x80 | (code >> 6 & 0x3F));
        out += static_cast<char>(0x80 | (code & 0x3F));
    }
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
    std::string out;
    for (; text != nullptr && *text != L'\0'; ++text) {
        const auto code = static_cast<char32_t>(*text);
        Append(out, IsValidCodePoint(code, 1) ? code : kReplacement);
    }
    return out;
}

}  // namespace avpost::tool
