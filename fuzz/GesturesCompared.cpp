// Gestures under parameters that make sense, more or less, through the module and the plain model
// call by call. Wrong is every difference: results, record, frames, flags or log lines.
#include <cstdio>
#include <cstdlib>

#include "FuzzFrames.h"
#include "FuzzParams.h"
#include "Twin.h"
#include "param/NaviParam.h"

namespace {

using fpnavi_fuzz::ByteSource;
using fpnavi_test::Twin;

constexpr double kWorkMax = 1 << 21;  // the model is slow
constexpr int32_t kPixelsMax = 1 << 14;
constexpr int32_t kManyFrames = 105;  // beyond what a record holds

struct Size {
    int32_t width;
    int32_t height;
};

// The frames' size; where the parameters make no sense, one that does.
Size FrameSize() {
    const int32_t width = fpnavi::s_imageWidth;
    const int32_t height = fpnavi::s_imageHeight;
    const bool sane = width >= 1 && height >= 1 && int64_t{width} * height <= int64_t{kPixelsMax};
    return sane ? Size{width, height} : Size{16, 16};
}

// What happens at one frame. The first byte is 0 for the plain sequence of a host service.
void OneFrame(ByteSource& source, fpnavi_fuzz::FramePainter& painter) {
    Twin& twin = Twin::Get();
    const uint8_t what = source.U8();
    if (fpnavi_fuzz::kDoubleScan || (what & 1) != 0) {
        const uint32_t reg24 = source.U32();
        twin.Zones(reg24, source.U32());
    }
    const std::vector<uint8_t> image = painter.Next();
    // The module reads a whole image and refuses what is none, so a sane size is all it reads.
    if ((what & 2) != 0)
        twin.Block(image, (what & 4) != 0 ? source.Range(0, 60) : fpnavi::s_imageWidth);
    else
        twin.SetImage(image);
    if ((what & 8) == 0)
        twin.Status();
    if ((what & 0x70) == 0x70)
        twin.FailAllocation(source.Range(1, 12), (what & 0x80) != 0);
    twin.Frame((what & 0xF0) == 0x60 ? 1 : 0);
    if ((what & 0xF0) == 0x50)
        twin.Vote(source.Range(0, 2));
}

void OneGesture(ByteSource& source) {
    Twin& twin = Twin::Get();
    const Size size = FrameSize();
    fpnavi_fuzz::FramePainter painter(source, size.width, size.height);
    const int32_t frames = source.OneIn(32) ? kManyFrames : source.Range(2, 16);
    // A short input has had its say after a few frames.
    for (int32_t i = 0; i < frames && (i < 4 || frames == kManyFrames || !source.Empty()); ++i)
        OneFrame(source, painter);
    twin.Vote(0);
    twin.Vote(1);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    ByteSource source(data, size);
    Twin& twin = Twin::Get();
    const host::ParamBlock params = fpnavi_fuzz::ChangedParams(source);
    twin.SetParam(&params);
    const bool drawable = int64_t{fpnavi::s_imageWidth} * fpnavi::s_imageHeight <= kPixelsMax;
    if (Twin::ImageFits() && drawable && fpnavi_fuzz::PairIsCheap(kWorkMax)) {
        twin.Clear();
        OneGesture(source);
        twin.Clear();
    }
    if (twin.Difference()) {
        std::fprintf(stderr, "module and model differ: %s\n", twin.Difference()->c_str());
        std::abort();
    }
    return 0;
}
