// ImgPreProcess: the steps of each mode, in their order. StretchRange: the last of them.
//
// Requirement: in the finger area, the grey level of the cut-off percentile becomes 0, that of the
// opposite percentile the full scale; greys in between linearly, truncated. Other pixels stay.
//
// Observation: the greys of the whole frame have been counted for the threshold. Those of the
// finger are the same less the background, whose pixels come in runs.
//
// Algorithm: subtract the background run by run from that histogram, find both percentiles in it,
// and stretch sixteen pixels at a time by a multiplication in place of the division.
#include "frame/PreProcess.h"

#include <algorithm>

#include "base/BitRows.h"
#include "base/NaviMath.h"
#include "base/NaviSimd.h"
#include "frame/NaviFrame.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

// Marks the dark pixels; the hg sensor needs nothing more. The last step also reads and writes
// bytes in the space behind the pixels.
void MarkDarkPixels(NaviFrame_t* img) {
    const Bytes16 meanThr = Splat16(128);
    const Bytes16 one = Splat16(1);
    const int32_t size = s_imageHeight * s_imageWidth;
    for (int32_t p = 0; p < size; p += kLanes) {
        const Bytes16 above = Excess16(Load16(img->pData + p), meanThr);
        Store16(img->pType + p, And16(Equal16(above, Splat16(0)), one));
    }
}

// Subtracts the pixels outside the finger area from hist [in, out]. Returns the number of the rest.
int32_t TakeOutBackground(const NaviFrame_t& img, int32_t (&hist)[kGreyLevels]) {
    const Bytes16 one = Splat16(1);
    const int32_t size = img.width * img.height;
    ByteCounter counter;
    for (int32_t p = 0; p < size; p += kWordPixels) {
        const int32_t count = std::min(size - p, kWordPixels);
        uint64_t finger = 0;  // bit i: pixel p + i
        for (int32_t i = 0; i < count; i += kLanes)
            finger |= uint64_t{TopBits16(Equal16(Load16(img.pType + p + i), one))} << i;
        for (uint64_t bits = ~finger & FirstBits(count); bits != 0;) {
            const int32_t start = __builtin_ctzll(bits);
            const uint64_t after = ~(bits >> start);
            const int32_t run = after != 0 ? __builtin_ctzll(after) : kWordPixels;
            counter.Add(img.pData + p + start, run);
            bits &= ~BitsBetween(start, start + run);
        }
    }
    int32_t rest = 0;
    for (int32_t level = 0; level < kGreyLevels; ++level) {
        hist[level] -= counter.Of(level);
        rest += hist[level];
    }
    return rest;
}

// The stretched grey is (grey - min) * scale / range, truncated and clamped to 255; below min it is
// 0. The division is a multiplication by scale / range in units of 1/2^16, rounded up: the product
// exceeds the quotient by less than 255 / 2^16 < 1 / 255, and a quotient that is no integer lies at
// least 1 / range >= 1 / 255 below the next one.
void StretchPixels(int32_t min, uint32_t range, uint32_t scale, NaviFrame_t* img) {
    const uint32_t factor = ((scale << 16) + range - 1) / range;  // at most 255 * 2^16
    const Bytes16 black = Splat16(static_cast<uint8_t>(min));
    const Bytes16 one = Splat16(1);
    const int32_t size = img->width * img->height;
    // The last step also changes bytes in the space behind the pixels; nothing reads those.
    for (int32_t p = 0; p < size; p += kLanes) {
        const Bytes16 grey = Load16(img->pData + p);
        const Bytes16 finger = Equal16(Load16(img->pType + p), one);
        const Bytes16 stretched = Scale16(Excess16(grey, black), factor);
        Store16(img->pData + p, Or16(And16(stretched, finger), AndNot16(grey, finger)));
    }
}

// StretchRange of a frame with pixels, cutOff percent of the finger cut off at both ends.
// hist [in, out]: all greys of img, counted; those of the finger area afterwards.
//
// Limits are in hundredths of a pixel. Where level 0 alone exceeds a limit, the percentile is 0.
// For a limit >= 0, count > limit / 100 (truncated) is the same as 100 * count > limit. Where no
// level exceeds the low limit, the high one is 0 or less, so that nothing is stretched.
void StretchFinger(NaviFrame_t* img, uint8_t scale, int32_t cutOff, int32_t (&hist)[kGreyLevels]) {
    const int32_t cnt = TakeOutBackground(*img, hist);  // at most 2^24
    const int32_t lo = WrapMul(cnt, cutOff);
    const int32_t hi = WrapMul(cnt, WrapSub(100, cutOff));
    const int32_t start = 100 * hist[0];  // at most 100 * 2^24 < 2^31
    const bool crossesLow = start <= lo;
    const bool crossesHigh = start < hi;
    const auto levels = FirstLevelsAbove(hist, crossesLow ? lo / 100 - hist[0] : 0,
                                         crossesHigh ? (hi - 1) / 100 - hist[0] : 0);
    const int32_t min = crossesLow ? levels.low - 1 : 0;
    const int32_t max = crossesHigh && levels.high < kGreyLevels ? levels.high : 0;
    if (max > min)
        StretchPixels(min, static_cast<uint32_t>(max - min), scale, img);
}

}  // namespace

int32_t StretchRange(NaviFrame_t* img, uint8_t scale) {
    if (!HasPixels(img))
        return -1;
    int32_t hist[kGreyLevels];
    CountBytes(img->pData, img->width * img->height, hist);
    StretchFinger(img, scale, s_cutOffPercent, hist);
    return 0;
}

int32_t ImgPreProcess(NaviFrame_t* img) {
    if (IsHg()) {
        MarkDarkPixels(img);
        return 0;
    }
    if (!HasPixels(img))
        return -1;
    const int32_t size = img->width * img->height;
    int32_t hist[kGreyLevels];
    CountBytes(img->pData, size, hist);
    int32_t thr;
    int32_t scale;  // at most 254
    SplitGreys(hist, size, &thr, &scale);
    img->range = static_cast<uint8_t>(scale);
    GetFingerRidge(img, thr);
    StretchFinger(img, kGreyMax, s_cutOffPercent, hist);
    return 0;
}

}  // namespace fpnavi
