// The parameter block: the 78 tunable numbers that SetNaviParam stores, the geometry derived from
// them, and names for what the flags among them say. Owns all of them; SetNaviParam alone writes
// them. Every value is stored unchecked.
#ifndef FPNAVI_NAVIPARAM_H
#define FPNAVI_NAVIPARAM_H

#include <cstddef>
#include <cstdint>

#include "FpNavi.h"

namespace fpnavi {

// Laid out as the block is. docs/parameters.md tells what each parameter does.
struct NaviParams {
#define NAVI_PARAM(name, value) int32_t name = value
#define NAVI_BAND(name, low, high) _NAVI_struRange name = {low, high}
#include "param/NaviParamList.h"
};
static_assert(sizeof(NaviParams) == FPNAVI_PARAM_NUM * sizeof(int32_t), "78 parameters");
static_assert(offsetof(NaviParams, _NAVI_range_recommend) == 22 * sizeof(int32_t), "22 values");
static_assert(offsetof(NaviParams, s_sensorWidth) == 32 * sizeof(int32_t), "then five bands");

inline NaviParams s_naviParams;

// Each parameter by its own name.
#define NAVI_PARAM(name, value) inline constexpr int32_t& name = s_naviParams.name
#define NAVI_BAND(name, low, high) inline constexpr _NAVI_struRange& name = s_naviParams.name
#include "param/NaviParamList.h"

// Derived by SetNaviParam; all 0 until then.
inline int32_t s_blockWidth = 0;       // pixels
inline int32_t s_blockHeight = 0;      // pixels
inline int32_t s_blockColNum = 0;      // blocks in a row
inline int32_t s_blockRowNum = 0;      // rows of blocks
inline int32_t s_doubleScanFlag = 0;   // 1 once a mode 2 has been set; never cleared
inline int32_t s_imageWidth = 0;       // pixels
inline int32_t s_imageHeight = 0;      // pixels
inline int32_t s_fullImageWidth = 0;   // pixels, gaps included
inline int32_t s_fullImageHeight = 0;  // pixels, gaps included
inline int32_t s_tpltNum = 0;          // templates in use: 4 or 8
inline int32_t s_tpltWidthUD = 0;      // template for up and down: wide and flat
inline int32_t s_tpltHeightUD = 0;
inline int32_t s_tpltWidthLR = 0;  // template for left and right: the other turned by a quarter
inline int32_t s_tpltHeightLR = 0;

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

#endif  // FPNAVI_NAVIPARAM_H
