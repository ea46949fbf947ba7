#include "MsanGestures.h"

#include <cstdio>
#include <cstring>

#include "FpNavi.h"
#include "GoldenGestureFile.h"

namespace {

using fpnavi_test::GoldenGestureHead;

constexpr size_t kRoom = size_t{256} * 256;  // bytes of a frame

uint8_t s_raw[kRoom];
uint8_t s_image[kRoom];

bool Read(std::FILE* file, void* data, size_t bytes) {
    return std::fread(data, 1, bytes, file) == bytes;
}

bool Fits(const GoldenGestureHead& head) {
    return head.width > 0 && head.height > 0 && head.width <= 256 && head.height <= 256;
}

// As a host replays it: the vote comes when the finger leaves, or at the end.
bool Replay(std::FILE* file, const GoldenGestureHead& head, int32_t* key) {
    bool seen = false;
    bool left = false;
    SetNaviParam(head.params);
    FpNaviClear();
    for (int32_t frame = 0; frame < head.frames; ++frame) {
        uint32_t registers[2];
        if (!Read(file, registers, sizeof registers) ||
            !Read(file, s_raw, static_cast<size_t>(head.width) * static_cast<size_t>(head.height)))
            return false;
        if (left)
            continue;
        if (head.doubleScan == 1)
            GetDoubleScanNaviBlock(registers[0], registers[1]);
        GetNaviBlock(s_raw, head.width, head.height, s_image);
        const int32_t status = vmk_fp_navigation_detect_finger_status(s_image);
        OrientationCalc(s_image, s_image, 0);
        seen = seen || status == 1;
        left = seen && status == 0;
    }
    *key = Voting(left ? 0 : 1);
    return true;
}

bool ReplayAll(std::FILE* file) {
    GoldenGestureHead head;
    int32_t gestures = 0;
    int32_t different = 0;
    for (; Read(file, &head, sizeof head); ++gestures) {
        int32_t key = -1;
        if (!Fits(head) || !Replay(file, head, &key)) {
            std::fprintf(stderr, "golden gesture %d: cut short, or too large\n", gestures);
            return false;
        }
        const bool equal =
            key == head.key && std::memcmp(PrintNaviLog(), head.record, sizeof head.record) == 0;
        different += equal ? 0 : 1;
    }
    std::printf("%d golden gestures, %d of them different\n", gestures, different);
    return gestures > 0 && different == 0;
}

}  // namespace

bool ReplayGoldenGestures(const char* path) {
    std::FILE* const file = std::fopen(path, "rb");
    if (file == nullptr) {
        std::fprintf(stderr, "%s: cannot be opened\n", path);
        return false;
    }
    const bool right = ReplayAll(file);
    std::fclose(file);
    return right;
}
