/* The finger-detect module: is the ridge texture of skin in a frame?
 *
 * The navigation module declares and calls FingerBLKTest only; whoever links it brings the
 * definition. This project's own definition is the library fpnavi::finger_detect. */
#ifndef FPSVC_CALLIB_INC_FINGERDETECT_H
#define FPSVC_CALLIB_INC_FINGERDETECT_H

#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

/* Measures five blocks of a frame, each half as wide and half as high as the frame:
 *
 *   block 0     the centre: columns width / 4 to width * 3 / 4 - 1, rows likewise
 *   block 1, 2  upper left and upper right quarter
 *   block 3, 4  lower left and lower right quarter
 *
 * The quarters part at column width / 2 and row height / 2 and hold every pixel once; the centre
 * lies over the inner corner of each of them.
 *
 * image: height rows of width bytes, 8-bit grey, row by row, the caller's; not kept.
 * width, height: pixels. results: ten signed 32-bit integers, the caller's; entries 0 to 4 receive
 * the texture response of the five blocks (0 for flat skin-less ground, larger for more ridge
 * structure; this library's unit is half a grey level of ridge signal, and 7 tells a finger from
 * none), entries 5 to 9 their mean grey (0..255). A block that cannot be measured (the frame is too
 * small, a null pointer) leaves its two entries as they are; this library measures frames with
 * sides of 16 to 32768 pixels, and of those all five blocks. mode: reserved, pass 0. */
void FingerBLKTest(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                   int32_t mode);

#ifdef __cplusplus
}
#endif

#endif /* FPSVC_CALLIB_INC_FINGERDETECT_H */
