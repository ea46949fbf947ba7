// Frames and parameter blocks, sane and hostile, through the module, for the memory sanitizer:
// every result that a host reads is looked at. C arrays only, so that no library without
// instrumentation touches the data.
//
//   msan_driver BLOCKS            sane and hostile blocks
//   msan_driver --golden FILE     golden gestures, whose records are known
#include <climits>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "FpNavi.h"
#include "MsanGestures.h"
#include "alog_host.h"
#include "param/NaviParam.h"
#include "parameters/ParamTable.h"

namespace {

constexpr int32_t kRoom = 256 * 256;  // bytes of an image that is filled
constexpr int32_t kFrames = 5;

uint8_t s_raw[kRoom];
uint8_t s_image[kRoom];
int64_t s_seen = 0;   // sum of all results: reads each of them
int64_t s_pairs = 0;  // pairs counted
uint64_t s_random = 0;

uint32_t Random() {
    s_random = s_random * 6364136223846793005ULL + 1442695040888963407ULL;
    return static_cast<uint32_t>(s_random >> 33);
}

int32_t Below(int32_t count) {
    return static_cast<int32_t>(Random() % static_cast<uint32_t>(count));
}

// Branches on the value, which is what the sanitizer watches.
void See(int64_t value) {
    s_seen += value > 0 ? value : 1;
}

int SeeLine(void* /*context*/, int /*level*/, const char* /*tag*/, const char* format,
            std::va_list args) {
    char text[2048];
    const int length = std::vsnprintf(text, sizeof text, format, args);
    for (int i = 0; i < length && i < static_cast<int>(sizeof text) - 1; ++i)
        See(text[i]);
    return length;
}

void SetDefaults(int32_t* params, int32_t mode) {
    for (size_t i = 0; i < FPNAVI_PARAM_NUM; ++i)
        params[i] = host::ParamTable()[i].defaultValue;
    params[*host::ParamIndex("s_modeFlag")] = mode;
    params[*host::ParamIndex("s_logShowFlag")] = Below(2);
    params[*host::ParamIndex("s_multiBloclkFlag")] = Below(4) > 0 ? 1 : 0;
}

// Up to four values at a boundary.
void MakeHostile(int32_t* params) {
    constexpr int32_t kValues[] = {INT_MIN, -1, 0, 1, 2, 127, 255, 256, INT_MAX};
    for (int32_t n = Below(5); n > 0; --n) {
        const auto at = static_cast<size_t>(Below(FPNAVI_PARAM_NUM));
        params[at] = kValues[Below(sizeof kValues / sizeof kValues[0])];
    }
}

// Ridges under a finger that covers the middle, moving by (dx, dy) pixels a frame; raw order is of
// no matter here.
void FillFrame(int32_t width, int32_t height, int32_t frame, int32_t dx, int32_t dy) {
    for (int32_t row = 0; row < height; ++row) {
        for (int32_t column = 0; column < width; ++column) {
            const int32_t x = column + 64 * dx + frame * dx + 1000;
            const int32_t y = row + 64 * dy + frame * dy + 1000;
            const int32_t ridge = (3 * x + 5 * y + (x * y / 64) % 7) % 28;
            const bool finger = column > width / 10 && column < width - width / 10;
            s_raw[row * width + column] =
                static_cast<uint8_t>(finger ? 30 + 5 * ridge + Below(6) : 225 + Below(20));
        }
    }
}

bool ImageFits() {
    using namespace fpnavi;
    const bool sane = s_blockWidth > 0 && s_blockHeight > 0 && s_blockColNum > 0 &&
                      s_blockRowNum > 0 && s_blockWidth <= 256 && s_blockHeight <= 256 &&
                      s_blockColNum <= 256 && s_blockRowNum <= 256;
    const bool hgFits = !IsHg() || s_imageWidthHg <= 0 || s_imageHeightHg <= 0 ||
                        int64_t{s_imageWidthHg} * s_imageHeightHg <= kRoom;
    return sane && hgFits && int64_t{s_imageWidth} * s_imageHeight <= kRoom;
}

void SeeRecord() {
    int32_t values[sizeof(NaviVoteInfo_t) / sizeof(int32_t)];
    std::memcpy(values, PrintNaviLog(), sizeof values);
    for (const int32_t value : values)
        See(value);
}

void RunGesture(int32_t mode) {
    FpNaviClear();
    const int32_t dx = Below(5) - 2;
    const int32_t dy = Below(9) - 4;
    for (int32_t frame = 0; frame < kFrames; ++frame) {
        FillFrame(fpnavi::s_imageWidth, fpnavi::s_imageHeight, frame, dx, dy);
        if (mode == 2) {
            const uint32_t reg24 = Random();
            See(GetDoubleScanNaviBlock(reg24, Random()));
        }
        See(GetNaviBlock(s_raw, fpnavi::s_imageWidth, fpnavi::s_imageHeight, s_image));
        See(OrientationCalc(s_image, s_image, 0));
    }
    s_pairs += PrintNaviLog()->calc_cnt;
    See(Voting(1));
    See(vmk_fp_navigation_detect_finger_status(s_image));
    See(Voting(0));
    SeeRecord();
    uint32_t dac = Random() & 0xFFU;
    const uint32_t gain20 = Random() & 0x070707U;
    const uint32_t gain2C = Random() & 0x070707U;
    for (int32_t call = 0; call < 3; ++call)
        See(_NAVI_Tune(s_image, 0, 0, &dac, &gain20, &gain2C) + static_cast<int64_t>(dac));
    FpNaviClear();
    SeeRecord();
}

bool RunBlocks(int32_t blocks) {
    int32_t ran = 0;
    for (int32_t block = 0; block < blocks; ++block) {
        // Mode 2 in the second half only: the double scan stays on.
        const int32_t mode = block < blocks / 2 ? block % 2 : block % 3;
        s_random = static_cast<uint64_t>(block) + 1;
        int32_t params[FPNAVI_PARAM_NUM];
        SetDefaults(params, mode);
        if (block % 4 != 0)
            MakeHostile(params);
        See(SetNaviParam(params));
        if (!ImageFits())
            continue;
        RunGesture(mode);
        ++ran;
    }
    std::printf("%d of %d blocks ran, %lld pairs counted, sum %lld\n", ran, blocks,
                static_cast<long long>(s_pairs), static_cast<long long>(s_seen));
    // A pair a block at least: with fewer the methods have not been reached.
    return s_pairs >= ran;
}

}  // namespace

int main(int argc, char** argv) {
    alog::SetSink(SeeLine, nullptr);
    // Not in one run: the double scan, once on, stays on.
    if (argc == 3 && std::strcmp(argv[1], "--golden") == 0)
        return ReplayGoldenGestures(argv[2]) ? 0 : 1;
    const int32_t blocks = argc == 2 ? std::atoi(argv[1]) : 0;
    if (blocks < 1) {
        std::fprintf(stderr, "usage: msan_driver BLOCKS | --golden FILE\n");
        return 2;
    }
    return RunBlocks(blocks) ? 0 : 1;
}
