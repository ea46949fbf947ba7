// Is there a finger? Chooses the detector behind vmk_fp_navigation_detect_finger_status and keeps
// its answer in s_lastFrameFlag. Owns nothing.
#ifndef FPNAVI_FINGERSTATUS_H
#define FPNAVI_FINGERSTATUS_H

#include <cstdint>

namespace fpnavi {

// Coverage, in percent, of a double-scan map [in] of 64 cells, of which those exactly 1 count.
int32_t DoubleScanFingerDetect(const uint8_t* DoubleScanZone);

}  // namespace fpnavi

#endif  // FPNAVI_FINGERSTATUS_H
