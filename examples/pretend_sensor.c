/* A sensor that is not there: four strokes of a round finger with ring-shaped ridges and a rest in
 * the middle, one frame each 20 ms, then silence. Frames are nine tiles with unread gaps between
 * them, as the default parameters have it, and become brighter with the DC register. */
#include <stdlib.h>

#include "sensor.h"

enum {
    BLOCK_WIDTH = 8,
    BLOCK_HEIGHT = 2,
    BLOCK_COLUMNS = SENSOR_WIDTH / BLOCK_WIDTH,
    WINDOW_WIDTH = 120, /* of the sensor's area that the tiles lie in, gaps included */
    WINDOW_HEIGHT = 68,
    IDLE_FRAMES = 20,   /* for the calibration, before the first finger */
    STROKE_FRAMES = 14, /* an even number */
    PAUSE_FRAMES = 2,
    FRAME_MS = 20,
    STEP = 5, /* pixels a frame */
};

#ifndef REST_FRAMES
#define REST_FRAMES STROKE_FRAMES /* of the finger that rests; a test has it rest for long */
#endif

/* Direction of each stroke, x to the right, y downwards, and its frames with a finger. */
static const struct {
    int x, y, frames;
} s_strokes[] = {{1, 0, STROKE_FRAMES},
                 {-1, 0, STROKE_FRAMES},
                 {0, 0, REST_FRAMES},
                 {0, -1, STROKE_FRAMES},
                 {0, 1, STROKE_FRAMES}};
enum { STROKES = sizeof s_strokes / sizeof s_strokes[0] };

static int s_frame = 0;
static uint32_t s_dc = 0x90;

/* Border tiles are 8 wide and high; 32 columns and 16 rows lie unread between tiles. */
static int window_column(int column) {
    return column < 8 ? column : (column < 48 ? column + 32 : column + 64);
}

static int window_row(int row) {
    return row < 8 ? row : (row < 28 ? row + 16 : row + 32);
}

/* Grey of the finger whose centre is dx, dy away: rings that get closer outwards. -1 beside it. */
static int finger_grey(int dx, int dy) {
    const int square = dx * dx + dy * dy;
    if (square > 60 * 60)
        return -1;
    const int phase = square / 12 % 60;
    return phase < 30 ? 40 + 4 * phase : 40 + 4 * (60 - phase);
}

/* The stroke of this frame: -1 before the first, STROKES after the last. *step: its frame, 0 when
 * the finger is in the middle of the sensor. */
static int stroke_now(int* step) {
    int since = s_frame - IDLE_FRAMES;
    int stroke = 0;
    if (since < 0)
        return -1;
    while (stroke < STROKES && since >= s_strokes[stroke].frames + PAUSE_FRAMES)
        since -= s_strokes[stroke++].frames + PAUSE_FRAMES;
    *step = since - STROKE_FRAMES / 2;
    return stroke;
}

/* Grey of a pixel in this frame, before the DC register. */
static int scene_grey(int x, int y) {
    int step = 0;
    const int stroke = stroke_now(&step);
    if (stroke >= 0 && stroke < STROKES && step + STROKE_FRAMES / 2 < s_strokes[stroke].frames) {
        const int grey = finger_grey(x - WINDOW_WIDTH / 2 - s_strokes[stroke].x * STEP * step,
                                     y - WINDOW_HEIGHT / 2 - s_strokes[stroke].y * STEP * step);
        if (grey >= 0)
            return grey;
    }
    return 180 + (x * 7 + y * 13 + s_frame * 5) % 4; /* bare sensor with a little noise */
}

int sensor_read_frame(uint8_t* raw) {
    int step = 0;
    if (stroke_now(&step) == STROKES)
        return -1;
    for (int row = 0; row < SENSOR_HEIGHT; ++row) {
        for (int column = 0; column < SENSOR_WIDTH; ++column) {
            const int block = row / BLOCK_HEIGHT * BLOCK_COLUMNS + column / BLOCK_WIDTH;
            const int inside = row % BLOCK_HEIGHT * BLOCK_WIDTH + column % BLOCK_WIDTH;
            const int grey = scene_grey(window_column(column), window_row(row)) +
                             ((int)(s_dc & 0xFF) - 0xA0) * 374 / 100;
            raw[block * BLOCK_WIDTH * BLOCK_HEIGHT + inside] =
                (uint8_t)(grey < 0 ? 0 : (grey > 255 ? 255 : grey));
        }
    }
    ++s_frame;
    return 0;
}

uint32_t sensor_read_dc(void) {
    return s_dc;
}

void sensor_write_dc(uint32_t value) {
    s_dc = value;
}

/* The codes of the reference gain that the parameter _NAVI_GAIN_REF holds. */
void sensor_read_gains(uint32_t* gain20, uint32_t* gain2C) {
    *gain20 = 0x20700;
    *gain2C = 0x102;
}

int64_t sensor_clock_ms(void) {
    return (int64_t)s_frame * FRAME_MS;
}
