#ifndef AVPOST_FUZZ_FUZZINPUT_H
#define AVPOST_FUZZ_FUZZINPUT_H

#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string>
#include <type_traits>
#include <vector>

// Takes typed values off the front of a fuzzer's input. Past the end every value is zero, so a
// short input is still a whole run. FuzzOutput writes the same layout, for seed inputs.
class FuzzInput {
public:
    FuzzInput(const uint8_t* data, size_t size) : data_(data), size_(size) {}

    template <typename T>
    T Take()
    {
        static_assert(std::is_trivially_copyable_v<T>);
        unsigned char bytes[sizeof(T)] = {};
        const size_t n = size_ - used_ < sizeof(T) ? size_ - used_ : sizeof(T);
        if (n != 0)
            std::memcpy(bytes, data_ + used_, n);
        used_ += n;
        T value;
        std::memcpy(&value, bytes, sizeof(T));
        return value;
    }

    // A value in [low, high], taken from 32 bits of input.
    int32_t InRange(int32_t low, int32_t high)
    {
        const uint64_t span = static_cast<uint64_t>(int64_t{high} - low) + 1;
        return static_cast<int32_t>(low + static_cast<int64_t>(Take<uint32_t>() % span));
    }
    bool Flag() { return (Take<uint8_t>() & 1) != 0; }

    std::vector<uint8_t> Bytes(size_t count)
    {
        const size_t n = size_ - used_ < count ? size_ - used_ : count;
        std::vector<uint8_t> bytes(data_ + used_, data_ + used_ + n);
        used_ += n;
        return bytes;
    }
    std::vector<uint8_t> Rest() { return Bytes(size_ - used_); }
    bool Empty() const { return used_ == size_; }

private:
    const uint8_t* data_;
    size_t size_;
    size_t used_ = 0;
};

class FuzzOutput {
public:
    template <typename T>
    FuzzOutput& Put(T value)
    {
        static_assert(std::is_trivially_copyable_v<T>);
        const auto* bytes = reinterpret_cast<const uint8_t*>(&value);
        bytes_.insert(bytes_.end(), bytes, bytes + sizeof(T));
        return *this;
    }
    // The input that makes FuzzInput::InRange(low, high) give value.
    FuzzOutput& PutInRange(int32_t value, int32_t low) { return Put<uint32_t>(static_cast<uint32_t>(value - low)); }
    FuzzOutput& PutBytes(const std::vector<uint8_t>& bytes)
    {
        bytes_.insert(bytes_.end(), bytes.begin(), bytes.end());
        return *this;
    }
    const std::vector<uint8_t>& bytes() const { return bytes_; }

private:
    std::vector<uint8_t> bytes_;
};

#endif
