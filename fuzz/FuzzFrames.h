// Frames made of the fuzzer's bytes: a textured finger that moves, flat ones, patterns and patches.
// A few bytes make a frame, so that the fuzzer can change one property at a time.
#ifndef FUZZ_FUZZFRAMES_H
#define FUZZ_FUZZFRAMES_H

#include <vector>

#include "ByteSource.h"

namespace fpnavi_fuzz {

class FramePainter {
  public:
    // Frames of height rows of width bytes, both at least 1. source must outlive the painter.
    FramePainter(ByteSource& source, int32_t width, int32_t height);

    std::vector<uint8_t> Next();

  private:
    std::vector<uint8_t> Finger();
    std::vector<uint8_t> Pattern();
    void Patch(std::vector<uint8_t>& image);
    uint8_t Skin(int32_t column, int32_t row) const;
    bool Covered(int32_t column, int32_t row) const;

    ByteSource& m_source;
    int32_t m_width;
    int32_t m_height;
    int32_t m_x = 0;  // how far the skin has moved, pixels
    int32_t m_y = 0;
    uint8_t m_style;       // of the skin
    uint8_t m_background;  // grey
    int32_t m_cover;       // of both sides, percent
};

// Frames of any bytes: size of them, the source's next ones repeated.
std::vector<uint8_t> RepeatedBytes(ByteSource& source, size_t size);

}  // namespace fpnavi_fuzz

#endif  // FUZZ_FUZZFRAMES_H
