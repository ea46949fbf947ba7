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
    const int32_t width = 8;
    const int32_t height = 8;
    const int32_t size = width * height;
    int32_t cnt = 0;
    int32_t x = 0;  // sums of cell centres in hundredths of a cell
    int32_t y = 0;
    for (int32_t cur = 0; cur < size; ++cur) {
        if (DoubleScanZone[cur] != 1)
            continue;
        ++cnt;
        x += 100 * (cur % width) + 50;
        y += 100 * (cur / width) + 50;
    }
    *xc = cnt == 0 ? 0 : x / (width * cnt) - 50;
    *yc = cnt == 0 ? 0 : 50 - y / (height * cnt);
    *cvr = 100 * cnt / size;
    return 0;
}

int32_t CalcDoubleScanMove(const uint8_t* pPrev, const uint8_t* pCurr, NaviVoteInfo_t* voteInfo) {
    int32_t xc_prev = 0;
    int32_t yc_prev = 0;
    int32_t cvr_prev = 0;
    int32_t xc_cvrr = 0;
    int32_t yc_cvrr = 0;
    int32_t cvr_cvrr = 0;
    if (DoubleScanGetCenterAndCoverage(pPrev, &xc_prev, &yc_prev, &cvr_prev) != 0)
        return -1;
    if (DoubleScanGetCenterAndCoverage(pCurr, &xc_cvrr, &yc_cvrr, &cvr_cvrr) != 0)
        return -1;
    const int32_t calc_cnt = PairCount(*voteInfo);
    if (calc_cnt == kPairCountMax)
        return -1;
    voteInfo->xc_ds[calc_cnt] = xc_prev;
    voteInfo->yc_ds[calc_cnt] = yc_prev;
    voteInfo->cvr_ds[calc_cnt] = cvr_prev;
    voteInfo->xc_ds[calc_cnt + 1] = xc_cvrr;
    voteInfo->yc_ds[calc_cnt + 1] = yc_cvrr;
    voteInfo->cvr_ds[calc_cnt + 1] = cvr_cvrr;
    voteInfo->dx_ds[calc_cnt] = xc_cvrr - xc_prev;
    voteInfo->dy_ds[calc_cnt] = yc_cvrr - yc_prev;
    return 0;
}

}  // namespace fpnavi

int32_t GetDoubleScanNaviBlock(uint32_t gReg24, uint32_t gReg28) {
    using namespace fpnavi;
    std::memcpy(DoubleScanZonePrev, DoubleScanZoneCurr, sizeof DoubleScanZonePrev);
    // Bit 31 of gReg28 is cell 0, bit 31 of gReg24 cell 32.
    for (int32_t count = 0; count < kZoneCells; ++count) {
        const uint32_t reg = count < 32 ? gReg28 : gReg24;
        DoubleScanZoneCurr[count] = static_cast<uint8_t>((reg >> (31 - count % 32)) & 1U);
    }
    return 0;
}
