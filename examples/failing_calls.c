/* For a test of gesture_loop.c only: two calls fail once. The linker puts these functions before
 * the library's (-Wl,--wrap). */
#include "FpNavi.h"

void __real_FpNaviClear(void);
int32_t __real_OrientationCalc(const uint8_t* data_prev, const uint8_t* data_curr,
                               int32_t time_out);
int32_t __real_Voting(int32_t time_out);
void __wrap_FpNaviClear(void);
int32_t __wrap_OrientationCalc(const uint8_t* data_prev, const uint8_t* data_curr,
                               int32_t time_out);
int32_t __wrap_Voting(int32_t time_out);

static int s_gesture = 0; /* from 1 */
static int s_call = 0;    /* of OrientationCalc in this gesture */

void __wrap_FpNaviClear(void) {
    ++s_gesture;
    s_call = 0;
    __real_FpNaviClear();
}

/* The sixth frame of the second gesture, in the middle of its stroke. */
int32_t __wrap_OrientationCalc(const uint8_t* data_prev, const uint8_t* data_curr,
                               int32_t time_out) {
    const int32_t result = __real_OrientationCalc(data_prev, data_curr, time_out);
    return ++s_call == 6 && s_gesture == 2 ? -1 : result;
}

int32_t __wrap_Voting(int32_t time_out) {
    return s_gesture == 4 ? -1 : __real_Voting(time_out);
}
