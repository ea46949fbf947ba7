// The plain model's calls.
#include "FingerDetect.h"
#include "Reference.h"
#include "Side.h"

namespace fpnavi_test {
namespace {

static_assert(sizeof(reference::NaviVoteInfo_t) == kRecordIntegers * sizeof(int32_t));

const int32_t* Record() {
    return reinterpret_cast<const int32_t*>(reference::PrintNaviLog());
}

void LogTo(std::vector<std::string>* lines) {
    reference::FingerBLKTest = ::FingerBLKTest;
    reference::s_logSink = lines;
}

}  // namespace

const Side& ModelSide() {
    static const Side side = {reference::SetNaviParam,
                              reference::FpNaviClear,
                              Record,
                              reference::GetNaviBlock,
                              reference::GetDoubleScanNaviBlock,
                              reference::OrientationCalc,
                              reference::Voting,
                              reference::vmk_fp_navigation_detect_finger_status,
                              reference::_NAVI_Tune,
                              LogTo};
    return side;
}

}  // namespace fpnavi_test
