// Names for what the flags of the parameter block say. A flag is stored unchecked: each predicate
// compares with one value, and any other value is its opposite. Owns nothing.
#ifndef FPNAVI_NAVIMODE_H
#define FPNAVI_NAVIMODE_H

#include <cstdint>

#include "param/NaviParam.h"

namespace fpnavi {

// Values of s_directionControlFlag. Any other value lets all keys pass.
constexpr int32_t kDirectionNone = 0;        // no key passes
constexpr int32_t kDirectionVertical = 1;    // up and down pass
constexpr int32_t kDirectionHorizontal = 2;  // left and right pass

// The hg mode: a coarse frame, centroid only. Every other mode is an fp mode.
inline bool IsHg() {
    return s_modeFlag == 1;
}

// The block set last asks for the fp mode with double scan. See ScansTwice.
inline bool IsDoubleScan() {
    return s_modeFlag == 2;
}

// The double scan is in use: IsDoubleScan held for a block set in this process. It stays in use
// when a later block sets another mode, even hg.
inline bool ScansTwice() {
    return s_doubleScanFlag == 1;
}

// The image is nine tiles with gaps between them, which a full image spreads apart.
inline bool IsTiled() {
    return s_multiBloclkFlag == 1;
}

// Sensor on the back of the device: left and right are exchanged.
inline bool IsOnBack() {
    return s_sensorBackFlag == 1;
}

// Every second row of the sensor only is scanned.
inline bool IsDownSampled() {
    return s_downSampleFlag == 1;
}

// Unit of a displacement: pixels or percent. The two methods read the flag differently, so with a
// value other than 0 and 1 the centroid is in percent and template matching in pixels.
inline bool CentroidInPixels() {
    return s_dimensionlessFlag == 0;
}
inline bool TemplateInPercent() {
    return s_dimensionlessFlag == 1;
}

// The fp vote may answer VKEY_NONE when the pairs do not decide.
inline bool MayAnswerNone() {
    return s_open_vkey_none_navi == 1;
}

// The hg finger test also takes a lighter touch for a finger.
inline bool IsHighSensitive() {
    return s_highSensitiveMode == 1;
}

// Diagnostic log lines are written.
inline bool LogShown() {
    return s_logShowFlag == 1;
}

}  // namespace fpnavi

#endif  // FPNAVI_NAVIMODE_H
