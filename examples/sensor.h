/* What gesture_loop.c wants of a sensor's driver. A service writes these functions over its
 * own; pretend_sensor.c draws a finger instead. */
#ifndef FPNAVI_EXAMPLES_SENSOR_H
#define FPNAVI_EXAMPLES_SENSOR_H

#include <stdint.h>

#define SENSOR_WIDTH 56  /* of a frame, pixels */
#define SENSOR_HEIGHT 36 /* rows */
#define SENSOR_FRAME_SIZE (SENSOR_WIDTH * SENSOR_HEIGHT)

/* Waits for the next frame and stores its SENSOR_FRAME_SIZE bytes in the order of the sensor: block
 * after block. Returns 0, or -1 when the sensor does not answer. */
int sensor_read_frame(uint8_t* raw);

/* The DC offset register of the analogue front end, and its two gain registers. */
uint32_t sensor_read_dc(void);
void sensor_write_dc(uint32_t value);
void sensor_read_gains(uint32_t* gain20, uint32_t* gain2C);

/* Milliseconds of a clock that never goes back. */
int64_t sensor_clock_ms(void);

#endif /* FPNAVI_EXAMPLES_SENSOR_H */
