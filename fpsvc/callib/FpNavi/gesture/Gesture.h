// The gesture's own flags. Owns the three below; FpNaviClear resets them.
#ifndef FPNAVI_GESTURE_H
#define FPNAVI_GESTURE_H

#include <cstdint>

namespace fpnavi {

extern int32_t s_frameNum;       // frames taken in this gesture; OrientationCalc counts
extern int32_t s_lastFrameFlag;  // 1 after a frame without a finger; FingerStatus sets it
extern int32_t s_tuneOkFlag;     // 1 when the last tuning call completed; Tune sets it

// The frame tested last showed no finger.
inline bool FingerLifted() {
    return s_lastFrameFlag == 1;
}

}  // namespace fpnavi

#endif  // FPNAVI_GESTURE_H
