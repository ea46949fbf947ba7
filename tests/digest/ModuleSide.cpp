// The module's calls, and its log lines as they are printed.
#include "FpNavi.h"
#include "LogLines.h"
#include "Side.h"

namespace fpnavi_test {
namespace {

static_assert(sizeof(NaviVoteInfo_t) == kRecordIntegers * sizeof(int32_t));

const int32_t* Record() {
    return reinterpret_cast<const int32_t*>(::PrintNaviLog());
}

}  // namespace

const Side& ModuleSide() {
    static const Side side = {::SetNaviParam,
                              ::FpNaviClear,
                              Record,
                              ::GetNaviBlock,
                              ::GetDoubleScanNaviBlock,
                              ::OrientationCalc,
                              ::Voting,
                              ::vmk_fp_navigation_detect_finger_status,
                              ::_NAVI_Tune,
                              LogTo};
    return side;
}

}  // namespace fpnavi_test
