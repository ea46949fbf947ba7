/* Finger navigation: small grey frames of a capacitive fingerprint sensor in, one key out.
 *
 * All functions work on file-level state: call them from one thread, one at a time.
 *
 * A gesture: FpNaviClear; for each sensor frame (GetDoubleScanNaviBlock in double-scan mode, then)
 * GetNaviBlock, vmk_fp_navigation_detect_finger_status, OrientationCalc; when the finger has left
 * or the host's time-out has expired, Voting. SetNaviParam comes once before everything else.
 *
 * Directions: x grows to the right (higher columns), y grows upwards (towards row 0).
 *
 * Wants C11 or C++11, or later: -std=c11. */
#ifndef FPSVC_CALLIB_INC_FPNAVI_H
#define FPSVC_CALLIB_INC_FPNAVI_H

#if !defined(__cplusplus) && (!defined(__STDC_VERSION__) || __STDC_VERSION__ < 201112L)
#error "FpNavi.h wants C11 or later: compile with -std=c11"
#endif

#include <assert.h>
#include <stddef.h>
#include <stdint.h>

#ifdef __cplusplus
extern "C" {
#endif

#if defined(__GNUC__)
#define FPNAVI_API __attribute__((visibility("default")))
#else
#define FPNAVI_API
#endif

/* Version of the library that this header belongs to. */
#define FPNAVI_VERSION_MAJOR 1
#define FPNAVI_VERSION_MINOR 7
#define FPNAVI_VERSION_PATCH 10

/* Key values: the results of Voting and the verdicts of the motion methods for one frame pair. */
typedef enum NaviVkey_t {
    VKEY_NONE = 0,   /* no statement */
    VKEY_UP = 1,     /* towards row 0 */
    VKEY_DOWN = 2,   /* towards the last row */
    VKEY_RIGHT = 3,  /* towards the last column */
    VKEY_LEFT = 4,   /* towards column 0 */
    VKEY_NO_MOVE = 5 /* the finger rested */
} NaviVkey_t;

/* Number of entries of the parameter block of SetNaviParam. */
#define FPNAVI_PARAM_NUM 78

/* Entries of each array of the vote record. Pair n fills entry n, and of the frame arrays also
 * n + 1, so a gesture counts at most 99 pairs. */
#define FPNAVI_VOTE_CAPACITY 100

/* One frame: grey values, class map and what has been measured of them. */
typedef struct NaviFrame_t {
    int32_t width;  /* columns */
    int32_t height; /* rows */
    uint8_t* pData; /* grey values, width x height bytes row by row; owned by the frame */
    uint8_t* pType; /* class map of the same shape: 1 finger, 0 not, 255 gap of a full image */
    int32_t cvr;    /* coverage: percent of the pixels that are finger */
    uint8_t range;  /* contrast: distance of the mean greys of the two classes */
    int32_t xc;     /* centroid column, percent of the width from the centre, to the right */
    int32_t yc;     /* centroid row, percent of the height from the centre, upwards */
} NaviFrame_t;

/* The vote record of one gesture. Frame arrays (xc, yc, cvr, xc_ds, yc_ds, cvr_ds) hold the
 * previous frame of pair n at n and its current frame at n + 1; the others hold pair n at n. */
typedef struct NaviVoteInfo_t {
    int32_t calc_cnt;                      /* pairs entered so far */
    int32_t xc[FPNAVI_VOTE_CAPACITY];      /* centroid columns of frames, percent */
    int32_t yc[FPNAVI_VOTE_CAPACITY];      /* centroid rows of frames, percent */
    int32_t cvr[FPNAVI_VOTE_CAPACITY];     /* coverage of frames, percent */
    int32_t dx_ct[FPNAVI_VOTE_CAPACITY];   /* displacement by the centroid method */
    int32_t dy_ct[FPNAVI_VOTE_CAPACITY];   /* (pixels, or percent if dimensionless) */
    int32_t dx_fp[FPNAVI_VOTE_CAPACITY];   /* displacement by template matching */
    int32_t dy_fp[FPNAVI_VOTE_CAPACITY];   /* (pixels, or percent of the sensor) */
    int32_t diff[FPNAVI_VOTE_CAPACITY];    /* mean grey difference of the best match, 0..255 */
    int32_t vkey_fp[FPNAVI_VOTE_CAPACITY]; /* verdict of template matching or no-move test */
    int32_t vkey_ct[FPNAVI_VOTE_CAPACITY]; /* verdict of the centroid method or no-move test */
    int32_t dx_sum;                        /* hg vote only: last minus first centroid column */
    int32_t dy_sum;                        /* hg vote only: last minus first centroid row */
    int32_t xc_ds[FPNAVI_VOTE_CAPACITY];   /* centroid columns of double-scan maps, percent */
    int32_t yc_ds[FPNAVI_VOTE_CAPACITY];   /* centroid rows of double-scan maps, percent */
    int32_t cvr_ds[FPNAVI_VOTE_CAPACITY];  /* coverage of double-scan maps, percent */
    int32_t dx_ds[FPNAVI_VOTE_CAPACITY];   /* displacement of the double-scan maps, percent */
    int32_t dy_ds[FPNAVI_VOTE_CAPACITY];
} NaviVoteInfo_t;

/* Tuning: size of an image in pixels. */
typedef struct _NAVI_SIZE {
    int32_t iHeight;
    int32_t iWidth;
} _NAVI_SIZE;

/* Tuning: a band of grey levels or percentages, both bounds inclusive. */
typedef struct _NAVI_struRange {
    uint32_t RANGE_LOW;
    uint32_t RANGE_HIGH;
} _NAVI_struRange;

/* Tuning: one rectangle of an image, starts inclusive, ends exclusive, in pixels. */
typedef struct _NAVI_BlkNode {
    int32_t StartWidth;
    int32_t StartHeight;
    int32_t EndWidth;
    int32_t EndHeight;
} _NAVI_BlkNode;

static_assert(sizeof(NaviVoteInfo_t) == 4 * (3 + 15 * FPNAVI_VOTE_CAPACITY),
              "the vote record is 1503 packed 32-bit integers");
static_assert(offsetof(NaviVoteInfo_t, xc) == 4, "calc_cnt comes first");
static_assert(offsetof(NaviVoteInfo_t, vkey_ct) == 4 * (1 + 9 * FPNAVI_VOTE_CAPACITY),
              "ten arrays lie before the sums");
static_assert(offsetof(NaviVoteInfo_t, dx_sum) == 4 * (1 + 10 * FPNAVI_VOTE_CAPACITY),
              "the sums follow the verdicts");
static_assert(offsetof(NaviVoteInfo_t, dy_ds) == 4 * (3 + 14 * FPNAVI_VOTE_CAPACITY),
              "the double-scan displacements come last");
static_assert(offsetof(NaviFrame_t, pData) == 8, "width and height come before the buffers");
static_assert(offsetof(NaviFrame_t, pType) == 8 + sizeof(uint8_t*), "pData comes before pType");
static_assert(offsetof(NaviFrame_t, cvr) == 8 + 2 * sizeof(uint8_t*), "pType comes before cvr");
static_assert(offsetof(NaviFrame_t, range) == offsetof(NaviFrame_t, cvr) + 4, "cvr before range");
static_assert(offsetof(NaviFrame_t, xc) == offsetof(NaviFrame_t, range) + 4, "range before xc");
static_assert(offsetof(NaviFrame_t, yc) == offsetof(NaviFrame_t, xc) + 4, "xc before yc");
static_assert(sizeof(_NAVI_SIZE) == 8 && offsetof(_NAVI_SIZE, iWidth) == 4, "height, width");
static_assert(sizeof(_NAVI_struRange) == 8 && offsetof(_NAVI_struRange, RANGE_HIGH) == 4,
              "low, high");
static_assert(sizeof(_NAVI_BlkNode) == 16 && offsetof(_NAVI_BlkNode, EndWidth) == 8,
              "start before end, width before height");

/* Stores the parameter block and derives the working geometry from it.
 *
 * params: FPNAVI_PARAM_NUM signed 32-bit integers in the order that docs/parameters.md lists; the
 * caller's, not kept. Every value is stored as it is; one that makes no sense is reported by the
 * calls that would use it. Mode 2 switches the double scan on for the life of the process.
 * Returns 0, or -1 for a null pointer (nothing changes then). */
FPNAVI_API int32_t SetNaviParam(const int32_t* params);

/* Starts a gesture: zeroes the gesture state and the vote record and releases the frames. Keeps
 * all parameters, and xc_ds and yc_ds of the record. Call it any number of times. */
FPNAVI_API void FpNaviClear(void);

/* Read access to the vote record. Returns always the same pointer; the record stays the module's
 * and holds its content until the next FpNaviClear. */
FPNAVI_API NaviVoteInfo_t* PrintNaviLog(void);

/* Sorts a raw block-ordered sensor frame into an image, row by row.
 *
 * p_data_origin: image width x height bytes, block after block (left to right, then down), each
 * block row by row; the caller's. p_data_resort: as many bytes for the image; the caller's, not
 * overlapping. width: bytes of the row that is replaced by the one below it when direction control
 * is 1 in mode 2, normally the image width; bytes beyond the image are neither read nor written.
 * height: not used. The geometry is that of SetNaviParam.
 * Returns 0, or -1 for a null pointer or a geometry that is not set or makes no sense (block
 * sizes or counts below 1, a side above 4096 pixels); nothing is written then. */
FPNAVI_API int32_t GetNaviBlock(const uint8_t* p_data_origin, int32_t width, int32_t height,
                                uint8_t* p_data_resort);

/* Takes the two hardware double-scan registers of a frame; call it once per frame before the other
 * calls of that frame. gReg28: map rows 0 to 3, gReg24: rows 4 to 7; the most significant byte is
 * the upper row, its most significant bit column 0. Returns 0. */
FPNAVI_API int32_t GetDoubleScanNaviBlock(uint32_t gReg24, uint32_t gReg28);

/* Takes the next frame of the gesture and evaluates it against the one before.
 *
 * data_prev: only tested for null; the module keeps its own copy of the frame before.
 * data_curr: the image of GetNaviBlock, image height rows of image width bytes; not kept.
 * time_out: 1 when the host's time-out has expired: the frame is ignored.
 * Returns 0 when the frame was taken or deliberately ignored (time-out, finger gone, 99 pairs
 * counted), -1 for a null pointer, a failed allocation, a geometry that is not set or makes no
 * sense, or a pair whose search would take absurdly long. After a failure on a frame every
 * further frame of the gesture fails too, until FpNaviClear. */
FPNAVI_API int32_t OrientationCalc(const uint8_t* data_prev, const uint8_t* data_curr,
                                   int32_t time_out);

/* Votes the gesture's key.
 *
 * time_out: 1 when the host's time-out has expired, else 0.
 * Returns a NaviVkey_t, or -1 when voting is not due (no time-out and the finger has not left) or
 * the vote is abandoned (motionless pairs scored because of s_minDelta <= 0).
 * The record is kept: a second call votes again. */
FPNAVI_API int32_t Voting(int32_t time_out);

/* Is a finger on the sensor?
 *
 * p_data: the image of GetNaviBlock, image height rows of image width bytes (in hg mode at least
 * s_imageWidthHg x s_imageHeightHg bytes); not kept. With double scan it is only tested for null:
 * the answer comes from the registers given to GetDoubleScanNaviBlock.
 * Returns 1 finger present, 0 no finger (this ends the gesture), -1 for a null pointer or a
 * geometry that makes no sense (the gesture goes on as it was). */
FPNAVI_API int32_t vmk_fp_navigation_detect_finger_status(const uint8_t* p_data);

/* One step of the calibration of the analogue front end's DC offset register.
 *
 * img: a frame, image height rows of image width bytes; not kept. img_width, img_height: not used,
 * the geometry is that of SetNaviParam. iTuneDAC: the DC register's value, read and written; write
 * it to the sensor after the call. iGain20, iGain2C: the two gain registers' values, read only.
 * Returns 1 when the calibration is complete, 0 when the host is to write the register and call
 * again with a fresh frame, -1 for a null pointer. In hg mode it returns 1 and does nothing. */
FPNAVI_API int32_t _NAVI_Tune(const uint8_t* img, int32_t img_width, int32_t img_height,
                              uint32_t* iTuneDAC, const uint32_t* iGain20, const uint32_t* iGain2C);

#ifdef __cplusplus
}
#endif

#endif /* FPSVC_CALLIB_INC_FPNAVI_H */
