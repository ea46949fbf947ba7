#include "motion/DoubleScan.h"

#include <cstring>

#include "gesture/Gesture.h"

namespace fpnavi {

uint8_t DoubleScanZonePrev[kZoneCells];
uint8_t DoubleScanZoneCurr[kZoneCells];

int32_t DoubleScanGetCenterAndCoverage(const uint8_t* DoubleScanZone, int32_t* xc, int32_t* yc,
                                       int32_t* cvr) {
    if (DoubleScanZone == nullptr || xc == nullptr || yc == nullptr || cvr == nullptr)
        return -1;
    constexpr int32_t kSide = 8;
    int32_t cnt = 0;
    int32_t x = 0;  // sums of cell centres in hundredths of a cell
    int32_t y = 0;
    for (int32_t cur = 0; cur < kZoneCells; ++cur) {
        if (DoubleScanZone[cur] != 1)
            continue;
        ++cnt;
        x += 100 * (cur % kSide) + 50;
        y += 100 * (cur / kSide) + 50;
    }
    *xc = cnt == 0 ? 0 : x / (kSide * cnt) - 50;
    *yc = cnt == 0 ? 0 : 50 - y / (kSide * cnt);
    *cvr = 100 * cnt / kZoneCells;
    return 0;
}

int32_t CalcDoubleScanMove(const uint8_t* pPrev, const uint8_t* pCurr, NaviVoteInfo_t* voteInfo) {
    const int32_t calc_cnt = PairCount(*voteInfo);
    if (pPrev == nullptr || pCurr == nullptr || calc_cnt == kPairCountMax)
        return -1;
    int32_t* const xc = voteInfo->xc_ds + calc_cnt;
    int32_t* const yc = voteInfo->yc_ds + calc_cnt;
    int32_t* const cvr = voteInfo->cvr_ds + calc_cnt;
    DoubleScanGetCenterAndCoverage(pPrev, xc, yc, cvr);
    DoubleScanGetCenterAndCoverage(pCurr, xc + 1, yc + 1, cvr + 1);
    voteInfo->dx_ds[calc_cnt] = xc[1] - xc[0];
    voteInfo->dy_ds[calc_cnt] = yc[1] - yc[0];
    return 0;
}

}  // namespace fpnavi

int32_t GetDoubleScanNaviBlock(uint32_t gReg24, uint32_t gReg28) {
    using namespace fpnavi;
    std::memcpy(DoubleScanZonePrev, DoubleScanZoneCurr, sizeof DoubleScanZonePrev);
    const uint64_t cells = uint64_t{gReg28} << 32 | gReg24;  // the top bit is cell 0
    for (int32_t count = 0; count < kZoneCells; ++count)
        DoubleScanZoneCurr[count] = static_cast<uint8_t>(cells >> (kZoneCells - 1 - count) & 1U);
    return 0;
}
