#include "presence/FingerStatus.h"

#include <algorithm>

#include "gesture/Gesture.h"
#include "motion/DoubleScan.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"
#include "presence/FingerStatusFp.h"
#include "presence/FingerStatusHg.h"

namespace fpnavi {
namespace {

// 1, 0 or -1 as the entry. p_data is not null.
int32_t DetectFinger(const uint8_t* p_data) {
    if (ScansTwice()) {
        // An empty map is no finger even under a negative threshold.
        const int32_t coverage = DoubleScanFingerDetect(DoubleScanZoneCurr);
        return coverage > std::max(s_DoubleScanCvrThreshold, 0) ? 1 : 0;
    }
    if (IsHg()) {
        if (!ImageGeometryUsable() || !HgDetectGeometryUsable())
            return -1;
        return NavFingerDetectHg(p_data);
    }
    if (!ImageGeometryUnset() && !ImageGeometryUsable())
        return -1;
    return NavFingerDetectFp(p_data);
}

}  // namespace

int32_t DoubleScanFingerDetect(const uint8_t* DoubleScanZone) {
    const int32_t width = 8;
    const int32_t height = 8;
    const auto count =
        static_cast<int32_t>(std::count(DoubleScanZone, DoubleScanZone + width * height, 1));
    return count * 100 / (width * height);
}

}  // namespace fpnavi

int32_t vmk_fp_navigation_detect_finger_status(const uint8_t* p_data) {
    using namespace fpnavi;
    if (p_data == nullptr)
        return -1;
    const int32_t fingerState = DetectFinger(p_data);
    if (fingerState != -1)
        s_lastFrameFlag = fingerState == 1 ? 0 : 1;
    return fingerState;
}
