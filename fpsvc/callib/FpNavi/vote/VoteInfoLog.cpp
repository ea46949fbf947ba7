#include "base/NaviLog.h"
#include "gesture/Gesture.h"
#include "vote/Voting.h"

// Deliberate: lists of single values are given eleven values for ten conversions. Readers of the
// log depend on ten, so the eleventh stays unprinted.
#pragma GCC diagnostic ignored "-Wformat-extra-args"

// A list of eleven entries, one or two values each. Macros, since they are arguments of a printf.
#define ELEVEN(a) \
    (a)[0], (a)[1], (a)[2], (a)[3], (a)[4], (a)[5], (a)[6], (a)[7], (a)[8], (a)[9], (a)[10]
#define ELEVEN_PAIRS(a, b)                                                                  \
    (a)[0], (b)[0], (a)[1], (b)[1], (a)[2], (b)[2], (a)[3], (b)[3], (a)[4], (b)[4], (a)[5], \
        (b)[5], (a)[6], (b)[6], (a)[7], (b)[7], (a)[8], (b)[8], (a)[9], (b)[9], (a)[10], (b)[10]
#define TEN_FORMATS " %d, %d, %d, %d, %d, %d, %d, %d, %d, %d\n"
#define ELEVEN_PAIR_FORMATS \
    " {(%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d) (%d,%d)"

namespace fpnavi {

constexpr char kFunction[] = "Voting_fp_mode";

void LogVoteInfo() {
    const NaviVoteInfo_t& info = s_voteInfo;
    const int32_t n = PairCount(info);
    NAVI_LOG(kFunction, 508, "##################### Vote information ########################\n");
    NAVI_LOG(kFunction, 510, "calculate count = %d\n", n);
    NAVI_LOG(kFunction, 512, "Initial and final centroid position are (%d, %d) and (%d, %d).\n",
             info.xc[0], info.yc[0], info.xc[n], info.yc[n]);
    NAVI_LOG(kFunction, 516, "Centroid method result array are:\n" TEN_FORMATS,
             ELEVEN(info.vkey_ct));
    NAVI_LOG(kFunction, 521, "Centroid results (dx, dy) array are:\n" ELEVEN_PAIR_FORMATS "}\n",
             ELEVEN_PAIRS(info.dx_ct, info.dy_ct));
    NAVI_LOG(kFunction, 523,
             "Initial and final centroid position of hardware navigation are (%d, %d) and "
             "(%d, %d).\n",
             info.xc_ds[0], info.yc_ds[0], info.xc_ds[n], info.yc_ds[n]);
    NAVI_LOG(kFunction, 528,
             "Centroid results of hardware navigation (dx, dy) array are:\n" ELEVEN_PAIR_FORMATS
             "}\n",
             ELEVEN_PAIRS(info.dx_ds, info.dy_ds));
    NAVI_LOG(kFunction, 532, "Fingerprint match result array are:\n" TEN_FORMATS,
             ELEVEN(info.vkey_fp));
    NAVI_LOG(kFunction, 537, "Fingerprint results (dx, dy) array are:\n" ELEVEN_PAIR_FORMATS " }\n",
             ELEVEN_PAIRS(info.dx_fp, info.dy_fp));
    NAVI_LOG(kFunction, 541, "Fingerprint diff array are:\n" TEN_FORMATS, ELEVEN(info.diff));
}

}  // namespace fpnavi
