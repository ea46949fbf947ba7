// Frames of any size: parameters that a sensor of that size has, and simulated gestures on it.
#ifndef BENCH_FRAMESIZE_H
#define BENCH_FRAMESIZE_H

#include <string>

#include "recording/Recording.h"
#include "simulator/Plan.h"

namespace bench {

enum class Layout : int32_t {
    Tiled,      // fp, nine tiles: borders of 8 pixels, gaps of 32 columns and 16 rows
    OneWindow,  // fp, the same tiles without gaps
    Hg,         // hg mode
};

struct FrameSize {
    int32_t width;  // pixels
    int32_t height;
    Layout layout;
    bool operator==(const FrameSize& other) const {
        return width == other.width && height == other.height && layout == other.layout;
    }
};

// What the default parameters give.
inline constexpr FrameSize kDefaultFp = {56, 36, Layout::Tiled};
inline constexpr FrameSize kDefaultHg = {40, 48, Layout::Hg};

// "96x64 tiled", "80x80 window", "80x96 hg".
std::string NameOf(const FrameSize& size);

// Takes "96x64"; the layout stays. False, and nothing changed, unless both sides lie in 17..4096:
// less has no centre between the borders.
bool ParseSides(const std::string& text, FrameSize* size);

// Default parameters but for the size: the image is one block, the centre what the borders leave.
host::ParamBlock ParamsOf(const FrameSize& size);

// The gesture of plan on a sensor with params; skin, patch and travel are drawn from plan.seed and
// made to fit the sensor's window. Frames only, no answers. Ridges are exact in windows of up to
// 200 pixels a side; further out the skin repeats its rim.
host::Gesture SimulateSized(const host::SimPlan& plan, const host::ParamBlock& params);

}  // namespace bench

#endif  // BENCH_FRAMESIZE_H
