#ifndef AVPOST_SUPPORT_LITTLEENDIAN_H
#define AVPOST_SUPPORT_LITTLEENDIAN_H

#include <cstdint>

// BMP and WAV files store their numbers least significant byte first, whatever the byte order of
// the machine reading or writing them.
namespace avpost::detail {

inline uint16_t ReadLe16(const unsigned char* bytes) { return static_cast<uint16_t>(bytes[0] | bytes[1] << 8); }

inline uint32_t ReadLe32(const unsigned char* bytes) { return ReadLe16(bytes) | uint32_t{ReadLe16(bytes + 2)} << 16; }

// Stores the low 16 bits of value.
inline void StoreLe16(unsigned char* bytes, uint32_t value)
{
    bytes[0] = static_cast<unsigned char>(value);
    bytes[1] = static_cast<unsigned char>(value >> 8);
}

inline void StoreLe32(unsigned char* bytes, uint32_t value)
{
    StoreLe16(bytes, value);
    StoreLe16(bytes + 2, value >> 16);
}

// Append to a container of bytes (std::vector<uint8_t>, std::string).
template <typename Bytes>
void AppendLe16(Bytes& out, uint32_t value)
{
    unsigned char bytes[2];
    StoreLe16(bytes, value);
    out.insert(out.end(), bytes, bytes + sizeof bytes);
}

template <typename Bytes>
void AppendLe32(Bytes& out, uint32_t value)
{
    unsigned char bytes[4];
    StoreLe32(bytes, value);
    out.insert(out.end(), bytes, bytes + sizeof bytes);
}

}  // namespace avpost::detail

#endif
