// An input of the fuzzer, taken apart from the front: numbers in ranges, picks and runs of bytes.
// An exhausted source gives zeros, so every input is a valid one and a cut one stays meaningful.
#ifndef FUZZ_BYTESOURCE_H
#define FUZZ_BYTESOURCE_H

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <vector>

namespace fpnavi_fuzz {

class ByteSource {
  public:
    // data stays the caller's and must outlive the source.
    ByteSource(const uint8_t* data, size_t size) : m_data(data), m_left(size) {}

    bool Empty() const { return m_left == 0; }
    size_t Left() const { return m_left; }

    uint8_t U8() {
        if (m_left == 0)
            return 0;
        --m_left;
        return *m_data++;
    }

    // Little endian.
    uint32_t U32() {
        uint32_t value = 0;
        for (unsigned shift = 0; shift < 32; shift += 8)
            value |= static_cast<uint32_t>(U8()) << shift;
        return value;
    }

    int32_t I32() { return static_cast<int32_t>(U32()); }

    // low..high, both inclusive, from one byte: at most 256 values, low <= high.
    int32_t Range(int32_t low, int32_t high) { return low + U8() % (high - low + 1); }

    // True for one of n values of a byte; a zero is none of them.
    bool OneIn(int32_t n) { return U8() % n == n - 1; }

    template <typename T, size_t N>
    T Pick(const T (&values)[N]) {
        return values[U8() % N];
    }

    // The next bytes, at most count of them.
    std::vector<uint8_t> Take(size_t count) {
        const size_t taken = std::min(count, m_left);
        std::vector<uint8_t> bytes(m_data, m_data + taken);
        m_data += taken;
        m_left -= taken;
        return bytes;
    }

  private:
    const uint8_t* m_data;
    size_t m_left;
};

}  // namespace fpnavi_fuzz

#endif  // FUZZ_BYTESOURCE_H
