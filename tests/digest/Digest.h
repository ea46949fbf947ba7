// A 64-bit hash that comes out equal on every processor: FNV-1a over bytes, integers taken as their
// bytes from the lowest to the highest.
#ifndef TESTS_DIGEST_DIGEST_H
#define TESTS_DIGEST_DIGEST_H

#include <cstddef>
#include <cstdint>
#include <string_view>

namespace fpnavi_test {

class Digest {
  public:
    void Byte(uint8_t value) { m_hash = (m_hash ^ value) * kPrime; }

    void Bytes(const uint8_t* data, size_t size) {
        for (size_t i = 0; i < size; ++i)
            Byte(data[i]);
    }

    void Unsigned(uint32_t value) {
        for (uint32_t shift = 0; shift < 32; shift += 8)
            Byte(static_cast<uint8_t>(value >> shift & 0xFFU));
    }

    // The two's complement.
    void Signed(int32_t value) { Unsigned(static_cast<uint32_t>(value)); }

    // Its length first, so that two texts are not one.
    void Text(std::string_view text) {
        Unsigned(static_cast<uint32_t>(text.size()));
        for (const char letter : text)
            Byte(static_cast<uint8_t>(letter));
    }

    uint64_t Value() const { return m_hash; }

  private:
    static constexpr uint64_t kOffset = 0xCBF29CE484222325ULL;
    static constexpr uint64_t kPrime = 0x100000001B3ULL;

    uint64_t m_hash = kOffset;
};

}  // namespace fpnavi_test

#endif  // TESTS_DIGEST_DIGEST_H
