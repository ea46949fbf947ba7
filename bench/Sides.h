// The two versions of the library under one shape: Plain is the model of tests/reference, Shipped
// the module. A step written once as a template over a side runs on both.
#ifndef BENCH_SIDES_H
#define BENCH_SIDES_H

#include <cstdint>
#include <cstdlib>

#include "FingerDetect.h"
#include "FpNavi.h"
#include "Reference.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "gesture/Gesture.h"
#include "matching/CandidateSearch.h"
#include "matching/PairMatch.h"
#include "motion/CenterMove.h"
#include "motion/FingerNoMove.h"
#include "param/NaviParam.h"

namespace bench {

// The members of a side, by the library's own names. A macro, since a namespace cannot be a
// template argument. exported: namespace of the exported functions, inner: of everything else.
#define BENCH_SIDE_MEMBERS(exported, inner)                                    \
    static int32_t SetNaviParam(const int32_t* params) {                       \
        return exported::SetNaviParam(params);                                 \
    }                                                                          \
    static void FpNaviClear() {                                                \
        exported::FpNaviClear();                                               \
    }                                                                          \
    static void TakeRegisters(uint32_t reg24, uint32_t reg28) {                \
        exported::GetDoubleScanNaviBlock(reg24, reg28);                        \
    }                                                                          \
    static int32_t OrientationCalc(const uint8_t* image) {                     \
        return exported::OrientationCalc(image, image, 0);                     \
    }                                                                          \
    static int32_t FingerStatus(const uint8_t* image) {                        \
        return exported::vmk_fp_navigation_detect_finger_status(image);        \
    }                                                                          \
    static const int32_t* Record() {                                           \
        return reinterpret_cast<const int32_t*>(exported::PrintNaviLog());     \
    }                                                                          \
    static int32_t Load(const uint8_t* image) {                                \
        return inner::ImgInit(&inner::s_imageCurr, 0, inner::s_imageHeight, 0, \
                              inner::s_imageWidth, image);                     \
    }                                                                          \
    static int32_t CalcBiThr(int32_t* thr, int32_t* scale) {                   \
        return inner::CalcBiThr(&inner::s_imageCurr, thr, scale);              \
    }                                                                          \
    static void GetFingerRidge(int32_t thr) {                                  \
        inner::GetFingerRidge(&inner::s_imageCurr, thr);                       \
    }                                                                          \
    static void StretchRange() {                                               \
        inner::StretchRange(&inner::s_imageCurr, 255);                         \
    }                                                                          \
    static void GetCenterAndCoverage() {                                       \
        inner::GetCenterAndCoverage(&inner::s_imageCurr);                      \
    }                                                                          \
    static int32_t FingerNoMove() {                                            \
        return inner::FingerNoMove(&inner::s_imagePrev, &inner::s_imageCurr);  \
    }                                                                          \
    static int32_t FindCandidate(int32_t* di, int32_t* dj) {                   \
        return inner::FindCandidate(di, dj);                                   \
    }                                                                          \
    static void GetFullImg() {                                                 \
        inner::GetFullImg(&inner::s_imagePrev, &inner::s_fullImagePrev);       \
        inner::GetFullImg(&inner::s_imageCurr, &inner::s_fullImageCurr);       \
    }                                                                          \
    static int32_t FindMatch(int32_t* di, int32_t* dj, int32_t* result) {      \
        return inner::FindMatch(di, dj, result, result + 1, result + 2);       \
    }                                                                          \
    static int32_t CalcImgJoint() {                                            \
        return inner::CalcImgJoint();                                          \
    }                                                                          \
    static int32_t CandidateNum() {                                            \
        return inner::s_candidateNum;                                          \
    }

struct Plain {
    static constexpr bool kFindMatchFrees = true;  // releases the candidate arrays
    BENCH_SIDE_MEMBERS(reference, reference)
};

struct Shipped {
    static constexpr bool kFindMatchFrees = false;
    BENCH_SIDE_MEMBERS(, fpnavi)
};

#undef BENCH_SIDE_MEMBERS

}  // namespace bench

#endif  // BENCH_SIDES_H
