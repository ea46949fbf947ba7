/* The shortest gesture: parameters as the module has them would need all 78 values, so a block of
 * zeroes is set, which every working call has to refuse. */
#ifndef CONSUMER_GESTURE_H
#define CONSUMER_GESTURE_H

#include "FpNavi.h"

static int RefusesEmptyGeometry(void) {
    static const int32_t params[FPNAVI_PARAM_NUM] = {0};
    static uint8_t image[64];
    if (SetNaviParam(params) != 0)
        return 0;
    FpNaviClear();
    return GetNaviBlock(image, 8, 8, image + 32) == -1 && OrientationCalc(image, image, 0) == -1 &&
           vmk_fp_navigation_detect_finger_status(NULL) == -1 && Voting(0) == -1 &&
           Voting(1) == VKEY_NO_MOVE && PrintNaviLog()->calc_cnt == 0 &&
           GetDoubleScanNaviBlock(0, 0) == 0 && _NAVI_Tune(NULL, 0, 0, NULL, NULL, NULL) == -1;
}

#endif /* CONSUMER_GESTURE_H */
