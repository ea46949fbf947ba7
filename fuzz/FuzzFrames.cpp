#include "FuzzFrames.h"

namespace fpnavi_fuzz {
namespace {

uint32_t Hash(int32_t column, int32_t row) {
    uint32_t h =
        static_cast<uint32_t>(column) * 2654435761U ^ static_cast<uint32_t>(row) * 2246822519U;
    h ^= h >> 15;
    h *= 2246822519U;
    return h ^ h >> 13;
}

}  // namespace

FramePainter::FramePainter(ByteSource& source, int32_t width, int32_t height)
    : m_source(source),
      m_width(width),
      m_height(height),
      m_style(source.U8()),
      m_background(static_cast<uint8_t>(255 - source.U8())),
      m_cover(source.Range(20, 120)) {}

// Bits 0 and 1 of the style: noise, two levels, ridges along either axis. The rest: their period.
uint8_t FramePainter::Skin(int32_t column, int32_t row) const {
    const int32_t x = column - m_x + 4096;
    const int32_t y = row - m_y + 4096;
    const int32_t period = 2 + (m_style >> 2) % 14;
    switch (m_style & 3) {
        case 0:
            return static_cast<uint8_t>(Hash(x, y));
        case 1:
            return (Hash(x / 2, y / 2) & 1U) != 0 ? 220 : 20;
        case 2:
            return static_cast<uint8_t>(30 + 180 * ((x + y / 4) % period) / period);
        default:
            return static_cast<uint8_t>(30 + 180 * ((y + x / 4) % period) / period);
    }
}

bool FramePainter::Covered(int32_t column, int32_t row) const {
    const int64_t dx = 2 * int64_t{column} + 1 - m_width - m_x;
    const int64_t dy = 2 * int64_t{row} + 1 - m_height - m_y;
    return std::abs(dx) * 100 <= int64_t{m_width} * m_cover &&
           std::abs(dy) * 100 <= int64_t{m_height} * m_cover;
}

std::vector<uint8_t> FramePainter::Finger() {
    std::vector<uint8_t> image;
    image.reserve(static_cast<size_t>(m_width) * static_cast<size_t>(m_height));
    for (int32_t row = 0; row < m_height; ++row) {
        for (int32_t column = 0; column < m_width; ++column)
            image.push_back(Covered(column, row) ? Skin(column, row) : m_background);
    }
    return image;
}

std::vector<uint8_t> RepeatedBytes(ByteSource& source, size_t size) {
    std::vector<uint8_t> cell = source.Take(1 + source.U8() % 32);
    if (cell.empty())
        cell.push_back(0);
    std::vector<uint8_t> bytes(size);
    for (size_t i = 0; i < size; ++i)
        bytes[i] = cell[i % cell.size()];
    return bytes;
}

std::vector<uint8_t> FramePainter::Pattern() {
    return RepeatedBytes(m_source, static_cast<size_t>(m_width) * static_cast<size_t>(m_height));
}

// A rectangle of one grey anywhere.
void FramePainter::Patch(std::vector<uint8_t>& image) {
    const int32_t left = m_source.U8() % m_width;
    const int32_t top = m_source.U8() % m_height;
    const int32_t right = std::min(m_width, left + m_source.Range(1, 16));
    const int32_t bottom = std::min(m_height, top + m_source.Range(1, 16));
    const uint8_t grey = m_source.U8();
    for (int32_t row = top; row < bottom; ++row) {
        for (int32_t column = left; column < right; ++column)
            image[static_cast<size_t>(row) * static_cast<size_t>(m_width) +
                  static_cast<size_t>(column)] = grey;
    }
}

std::vector<uint8_t> FramePainter::Next() {
    const uint8_t kind = m_source.U8();
    if (kind % 16 == 15)
        return Pattern();
    if (kind % 16 == 14)
        m_cover = m_source.Range(0, 120);
    m_x += m_source.Range(-8, 8);
    m_y += m_source.Range(-8, 8);
    std::vector<uint8_t> image = Finger();
    for (int32_t patches = kind / 16 % 4; patches > 0; --patches)
        Patch(image);
    return image;
}

}  // namespace fpnavi_fuzz
