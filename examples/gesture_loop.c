/* The loop of a host service in fp mode: calibrates the sensor, then turns one gesture after
 * another into a key. Copy it and bring the functions of sensor.h.
 *
 * Everything runs in one thread: the library keeps its state in the process. */
#include <inttypes.h>
#include <stdio.h>

#include "FpNavi.h"
#include "sensor.h"

#define TIME_OUT_MS 1500         /* a finger that stays longer is a long press */
#define CALIBRATION_CALLS_MAX 16 /* a sensor that does not get there is broken */

/* In the order of docs/parameters.md; these are the defaults. */
static const int32_t s_params[FPNAVI_PARAM_NUM] = {
    0,   3,     8,   4,   5,   12,  180, 3,   2,   8,   40, 48,  2,  1,   0, 2,  0,  1,  128, 128,
    374, 10002, 180, 220, 160, 240, 140, 220, 160, 200, 10, 15,  80, 200, 8, 2,  7,  18, 40,  20,
    8,   8,     32,  16,  50,  15,  2,   2,   200, 10,  6,  100, 30, 30,  7, 40, 90, 0,  1,   0,
    3,   100,   -1,  -1,  1,   3,   10,  80,  20,  4,   9,  80,  50, 1,   5, 12, 10, 0,
};

#define SENSOR_SILENT (-2) /* next_frame: the sensor does not answer any more */

/* The next frame of the sensor as an image of SENSOR_FRAME_SIZE bytes. Returns 1 when a finger is
 * on it, 0 when none is, -1 when the library refuses the frame, or SENSOR_SILENT. */
static int next_frame(uint8_t* image) {
    uint8_t raw[SENSOR_FRAME_SIZE];
    if (sensor_read_frame(raw) != 0)
        return SENSOR_SILENT;
    if (GetNaviBlock(raw, SENSOR_WIDTH, SENSOR_HEIGHT, image) != 0)
        return -1;
    return vmk_fp_navigation_detect_finger_status(image);
}

/* Steers the DC register until the frames are bright enough, without a finger on the sensor.
 * Returns 0, or -1 when the sensor does not answer or cannot be calibrated. */
static int calibrate(void) {
    uint8_t image[SENSOR_FRAME_SIZE];
    uint32_t gain20 = 0;
    uint32_t gain2C = 0;
    sensor_read_gains(&gain20, &gain2C);
    for (int call = 0; call < CALIBRATION_CALLS_MAX; ++call) {
        if (next_frame(image) < 0)
            return -1;
        uint32_t dc = sensor_read_dc();
        const int32_t done = _NAVI_Tune(image, SENSOR_WIDTH, SENSOR_HEIGHT, &dc, &gain20, &gain2C);
        if (done < 0)
            return -1;
        sensor_write_dc(dc);
        if (done == 1)
            return 0;
    }
    return -1;
}

/* Waits for a finger and follows it until it leaves or stays too long. *finger is what next_frame
 * said of the last frame. Returns a NaviVkey_t, or -1 for a gesture without a key: the sensor is
 * silent, or a call failed and the gesture is given up. */
static int32_t next_key(int* finger) {
    uint8_t image[SENSOR_FRAME_SIZE];
    int64_t touched_at = -1; /* ms; -1 until a finger has come */
    FpNaviClear();
    for (;;) {
        *finger = next_frame(image);
        if (*finger < 0)
            return -1;
        const int64_t now = sensor_clock_ms();
        if (touched_at < 0 && *finger == 1)
            touched_at = now;
        const int32_t time_out = touched_at >= 0 && now - touched_at > TIME_OUT_MS ? 1 : 0;
        if (OrientationCalc(image, image, time_out) != 0)
            return -1;
        if (touched_at >= 0 && (*finger == 0 || time_out == 1))
            return Voting(time_out);
    }
}

/* Reads frames until one shows no finger, so that what is left of a gesture after its time-out or a
 * failed call does not become the next. *finger as for next_key. */
static void wait_for_lift(int* finger) {
    uint8_t image[SENSOR_FRAME_SIZE];
    while (*finger != 0 && *finger != SENSOR_SILENT)
        *finger = next_frame(image);
}

int main(void) {
    static const char* const names[] = {"NONE", "UP", "DOWN", "RIGHT", "LEFT", "NO_MOVE"};
    int finger = 0;
    if (SetNaviParam(s_params) != 0 || calibrate() != 0) {
        fputs("the sensor cannot be calibrated\n", stderr);
        return 1;
    }
    printf("calibrated: DC register 0x%" PRIX32 "\n", sensor_read_dc());
    while (finger != SENSOR_SILENT) {
        const int32_t key = next_key(&finger);
        if (key >= 0)
            printf("%s\n", names[key]); /* a service sends an input event here */
        wait_for_lift(&finger);
    }
    return 0;
}
