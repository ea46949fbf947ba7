// Gestures that the host tests build frame by frame, from plain images.
#ifndef TESTS_HOST_GESTUREBUILDER_H
#define TESTS_HOST_GESTUREBUILDER_H

#include <cstdint>
#include <functional>
#include <string>
#include <vector>

#include "parameters/ParamTable.h"
#include "recording/Recording.h"

namespace host_test {

// Grey noise without structure, a fixed function of the place: 0..255.
inline uint8_t NoiseAt(int32_t row, int32_t column) {
    uint32_t h = static_cast<uint32_t>(row + 1000) * 2654435761U ^
                 static_cast<uint32_t>(column + 1000) * 2246822519U;
    h ^= h >> 15;
    h *= 2246822519U;
    h ^= h >> 13;
    return static_cast<uint8_t>(h >> 16);
}

struct Rect {
    int32_t row = 0;
    int32_t column = 0;
    int32_t rows = 0;
    int32_t columns = 0;
};

class GestureBuilder {
  public:
    explicit GestureBuilder(host::Mode mode, std::string id = "built") {
        m_gesture.id = std::move(id);
        m_gesture.mode = mode;
        m_gesture.params = host::ParamsForMode(mode, true);
        m_gesture.geometry = host::GeometryOf(m_gesture.params);
    }

    GestureBuilder& Param(const char* name, int32_t value) {
        host::ParamValue(m_gesture.params, name) = value;
        return *this;
    }

    // A frame with grey(row, column).
    GestureBuilder& Frame(const std::function<uint8_t(int32_t, int32_t)>& grey) {
        const host::Geometry& g = m_gesture.geometry;
        host::RecordedFrame frame;
        for (int32_t block = 0; block < g.blockColNum * g.blockRowNum; ++block) {
            for (int32_t row = 0; row < g.blockHeight; ++row) {
                for (int32_t column = 0; column < g.blockWidth; ++column)
                    frame.raw.push_back(grey(block / g.blockColNum * g.blockHeight + row,
                                             block % g.blockColNum * g.blockWidth + column));
            }
        }
        m_gesture.frames.push_back(std::move(frame));
        return *this;
    }

    GestureBuilder& Empty() {
        return Frame([](int32_t, int32_t) { return uint8_t{255}; });
    }

    // Skin everywhere, moved by dx columns to the right and dy rows upwards.
    GestureBuilder& Skin(int32_t dx, int32_t dy = 0) {
        return Frame([=](int32_t row, int32_t column) { return NoiseAt(row + dy, column - dx); });
    }

    // Skin in a rectangle only, moved within it as above; the rest is empty.
    GestureBuilder& Patch(const Rect& rect, int32_t dx = 0) {
        return Frame([=](int32_t row, int32_t column) {
            const bool inside = row >= rect.row && row < rect.row + rect.rows &&
                                column >= rect.column && column < rect.column + rect.columns;
            // At most 200: the brightest skin is darker than the empty sensor.
            return static_cast<uint8_t>(inside ? NoiseAt(row, column - dx) * 200 / 255 : 255);
        });
    }

    // Zone registers and true position (pixels; y downwards) of the frame added last.
    GestureBuilder& Registers(uint32_t reg28, uint32_t reg24) {
        m_gesture.frames.back().reg28 = reg28;
        m_gesture.frames.back().reg24 = reg24;
        return *this;
    }
    GestureBuilder& At(int32_t x, int32_t y) {
        m_gesture.frames.back().x16 = 16 * x;
        m_gesture.frames.back().y16 = 16 * y;
        return *this;
    }

    GestureBuilder& Label(int32_t key) {
        m_gesture.label = key;
        m_gesture.accepted = {key};
        return *this;
    }

    const host::Gesture& Get() const { return m_gesture; }

  private:
    host::Gesture m_gesture;
};

}  // namespace host_test

#endif  // TESTS_HOST_GESTUREBUILDER_H
