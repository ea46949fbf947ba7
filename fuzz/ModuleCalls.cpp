// Programs of the nine exported calls in any order, with any parameters and any frames. Each buffer
// is exactly as large as the header demands. Wrong is what the sanitizers report, and a result that
// the header does not have.
#include <cstdarg>
#include <cstdio>
#include <cstdlib>
#include <memory>

#include "FpNavi.h"
#include "FuzzFrames.h"
#include "FuzzParams.h"
#include "alog_host.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"

namespace {

using fpnavi_fuzz::ByteSource;

constexpr int64_t kBytesMax = 1 << 18;  // larger images are skipped: they are only slow
constexpr int32_t kCallsMax = 64;
constexpr double kWorkMax = 1 << 21;

// Prints every line, so that a wrong format shows.
int TakeLine(void* /*context*/, int /*priority*/, const char* /*tag*/, const char* format,
             std::va_list args) __attribute__((format(printf, 4, 0)));
int TakeLine(void* /*context*/, int /*priority*/, const char* /*tag*/, const char* format,
             std::va_list args) {
    char line[2048];
    return std::vsnprintf(line, sizeof line, format, args);
}

void Expect(bool holds, const char* what) {
    if (!holds) {
        std::fprintf(stderr, "not so: %s\n", what);
        std::abort();
    }
}

// Bytes of a width x height image; 1 where it has none, -1 where it is too large.
int64_t BytesOf(int32_t width, int32_t height) {
    if (width < 1 || height < 1)
        return 1;
    const int64_t bytes = int64_t{width} * height;
    return bytes <= kBytesMax ? bytes : -1;
}

// The finger test reads as many bytes as the larger of two images has.
int64_t StatusBytes() {
    const int64_t image = BytesOf(fpnavi::s_imageWidth, fpnavi::s_imageHeight);
    if (!fpnavi::IsHg() || image < 0)
        return image;
    const int64_t hg = BytesOf(fpnavi::s_imageWidthHg, fpnavi::s_imageHeightHg);
    return hg < 0 ? hg : std::max(image, hg);
}

// A buffer of exactly that size, so that the address sanitizer sees every byte too far.
std::unique_ptr<uint8_t[]> Image(ByteSource& source, int64_t bytes) {
    const auto size = static_cast<size_t>(bytes);
    auto image = std::make_unique<uint8_t[]>(size);
    std::vector<uint8_t> content;
    const bool isImage =
        int64_t{fpnavi::s_imageWidth} * fpnavi::s_imageHeight == bytes && fpnavi::s_imageWidth > 0;
    if (isImage && !source.OneIn(4)) {
        fpnavi_fuzz::FramePainter painter(source, fpnavi::s_imageWidth, fpnavi::s_imageHeight);
        content = painter.Next();
    } else {
        content = fpnavi_fuzz::RepeatedBytes(source, size);
    }
    std::copy(content.begin(), content.end(), image.get());
    return image;
}

void CallSet(ByteSource& source) {
    const host::ParamBlock params = fpnavi_fuzz::AnyParams(source);
    Expect(::SetNaviParam(params.data()) == 0, "SetNaviParam stores anything");
}

void CallBlock(ByteSource& source) {
    const int64_t bytes = BytesOf(fpnavi::s_imageWidth, fpnavi::s_imageHeight);
    if (bytes < 0)
        return;
    const auto raw = Image(source, bytes);
    const auto sorted = std::make_unique<uint8_t[]>(static_cast<size_t>(bytes));
    int32_t width = fpnavi::s_imageWidth;
    if (source.OneIn(4))
        width = source.OneIn(4) ? source.I32() : source.U8();
    const int32_t result = ::GetNaviBlock(raw.get(), width, source.U8(), sorted.get());
    Expect(result == (fpnavi::ImageGeometryUsable() ? 0 : -1), "GetNaviBlock: 0, or -1 refused");
}

void CallStatus(ByteSource& source) {
    const int64_t bytes = StatusBytes();
    if (bytes < 0)
        return;
    const auto image = Image(source, bytes);
    const int32_t result = ::vmk_fp_navigation_detect_finger_status(image.get());
    Expect(result >= -1 && result <= 1, "finger status: -1, 0 or 1");
}

void CallPair(ByteSource& source) {
    const int64_t bytes = BytesOf(fpnavi::s_imageWidth, fpnavi::s_imageHeight);
    if (bytes < 0 || !fpnavi_fuzz::PairIsCheap(kWorkMax))
        return;
    const auto image = Image(source, bytes);
    const int32_t timeOut = source.OneIn(16) ? 1 : 0;
    const int32_t result = ::OrientationCalc(image.get(), image.get(), timeOut);
    Expect(result == 0 || result == -1, "OrientationCalc: 0 or -1");
    const int32_t pairs = ::PrintNaviLog()->calc_cnt;
    Expect(pairs >= 0 && pairs < FPNAVI_VOTE_CAPACITY, "at most 99 pairs");
}

void CallTune(ByteSource& source) {
    const int64_t bytes = BytesOf(fpnavi::s_imageWidth, fpnavi::s_imageHeight);
    if (bytes < 0)
        return;
    const auto image = Image(source, bytes);
    const uint32_t mask = source.OneIn(4) ? 0xFFFFFFFFU : 0x00070707U;
    uint32_t dac = source.U32();
    const uint32_t gain20 = source.U32() & mask;
    const uint32_t gain2C = source.U32() & mask;
    const int32_t result =
        ::_NAVI_Tune(image.get(), source.U8(), source.U8(), &dac, &gain20, &gain2C);
    Expect(result == 0 || result == 1, "_NAVI_Tune: 0 or 1");
}

void CallVote(ByteSource& source) {
    const int32_t key = ::Voting(source.Range(0, 2));
    Expect(key >= -1 && key <= VKEY_NO_MOVE, "Voting: a key or -1");
}

void CallWithNull() {
    Expect(::SetNaviParam(nullptr) == -1, "SetNaviParam(null)");
    Expect(::GetNaviBlock(nullptr, 1, 1, nullptr) == -1, "GetNaviBlock(null)");
    Expect(::vmk_fp_navigation_detect_finger_status(nullptr) == -1, "finger status(null)");
    Expect(::_NAVI_Tune(nullptr, 0, 0, nullptr, nullptr, nullptr) == -1, "_NAVI_Tune(null)");
}

void Call(ByteSource& source) {
    switch (source.U8() % 16) {
        case 0:
            return CallSet(source);
        case 1:
            return ::FpNaviClear();
        case 2:
        case 3:
            return CallBlock(source);
        case 4:
        case 5:
            return CallStatus(source);
        case 6: {
            const uint32_t reg24 = source.U32();
            return Expect(::GetDoubleScanNaviBlock(reg24, source.U32()) == 0, "zones: 0");
        }
        case 7:
            return CallVote(source);
        case 8:
        case 9:
            return CallTune(source);
        case 10:
            return CallWithNull();
        default:
            return CallPair(source);
    }
}

// Completes a calibration under the defaults and clears the gesture: what an input before this one
// has left is gone, and an input alone does what it did among others.
void StartAfresh() {
    host::ParamBlock params = host::ParamsForMode(
        fpnavi_fuzz::kDoubleScan ? host::Mode::DoubleScan : host::Mode::Fp, false);
    host::ParamValue(params, "_NAVI_TimeOut_threshold") = 1;
    host::ParamValue(params, "_NAVI_DC_REF") = 0;
    ::SetNaviParam(params.data());
    const std::vector<uint8_t> image(static_cast<size_t>(fpnavi::s_imageWidth) *
                                     static_cast<size_t>(fpnavi::s_imageHeight));
    uint32_t dac = 255;
    const uint32_t gain = 0;
    Expect(::_NAVI_Tune(image.data(), 0, 0, &dac, &gain, &gain) == 1, "the calibration ends");
    ::FpNaviClear();
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    alog::SetSink(TakeLine, nullptr);
    ByteSource source(data, size);
    StartAfresh();
    CallSet(source);
    for (int32_t calls = 0; calls < kCallsMax && !source.Empty(); ++calls)
        Call(source);
    ::FpNaviClear();
    return 0;
}
