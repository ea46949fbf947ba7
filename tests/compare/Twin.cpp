#include "Twin.h"

#include <algorithm>
#include <cstring>

#include "FailingMalloc.h"
#include "FingerDetect.h"
#include "LogLines.h"
#include "Reference.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "motion/CenterMove.h"
#include "motion/DoubleScan.h"
#include "param/NaviLimits.h"
#include "param/NaviParam.h"
#include "tuning/Tune.h"

namespace fpnavi_test {
namespace {

constexpr size_t kImageBytes = size_t{1} << 20;

std::string Number(int64_t value) {
    return std::to_string(value);
}

}  // namespace

Twin& Twin::Get() {
    static Twin twin;
    return twin;
}

Twin::Twin() : m_image(kImageBytes), m_imageReference(kImageBytes) {
    reference::ResetAll();
    reference::FingerBLKTest = ::FingerBLKTest;
    reference::s_logSink = &m_logReference;
    LogTo(&m_log);
}

void Twin::SetParam(const host::ParamBlock* params) {
    const int32_t* const values = params != nullptr ? params->data() : nullptr;
    const int32_t module = ::SetNaviParam(values);
    Check("SetNaviParam", module, reference::SetNaviParam(values));
}

void Twin::Clear() {
    ::FpNaviClear();
    reference::FpNaviClear();
    Check("FpNaviClear", 0, 0);
    CompareImages("FpNaviClear", kImageBytes);  // nothing was written behind the frames
}

void Twin::Zones(uint32_t reg24, uint32_t reg28) {
    const int32_t module = ::GetDoubleScanNaviBlock(reg24, reg28);
    Check("GetDoubleScanNaviBlock", module, reference::GetDoubleScanNaviBlock(reg24, reg28));
}

void Twin::Block(const std::vector<uint8_t>& raw, int32_t width) {
    const int32_t module = ::GetNaviBlock(raw.data(), width, 0, m_image.data());
    Check("GetNaviBlock", module,
          reference::GetNaviBlock(raw.data(), width, 0, m_imageReference.data()));
    CompareImages("GetNaviBlock", static_cast<size_t>(fpnavi::s_imageWidth) *
                                      static_cast<size_t>(fpnavi::s_imageHeight));
}

void Twin::Status(bool nullFrame) {
    const uint8_t* const data = nullFrame ? nullptr : m_image.data();
    const int32_t module = ::vmk_fp_navigation_detect_finger_status(data);
    Check("finger status", module, reference::vmk_fp_navigation_detect_finger_status(data));
}

void Twin::Frame(int32_t timeOut, bool nullPrev, bool nullCurr) {
    const uint8_t* const prev = nullPrev ? nullptr : m_image.data();
    const uint8_t* const curr = nullCurr ? nullptr : m_image.data();
    if (m_failing > 0 && m_failingForGood)
        FailingMalloc::FailFrom(m_failing);
    else if (m_failing > 0)
        FailingMalloc::FailNth(m_failing);
    const int32_t module = ::OrientationCalc(prev, curr, timeOut);
    FailingMalloc::Off();
    reference::s_allocationCount = 1;
    reference::s_failAllocation = m_failing > 0 && !m_failingForGood ? m_failing : -1;
    reference::s_failAllocationsFrom = m_failing > 0 && m_failingForGood ? m_failing : -1;
    const int32_t plain = reference::OrientationCalc(prev, curr, timeOut);
    reference::s_failAllocation = -1;
    reference::s_failAllocationsFrom = -1;
    m_failing = 0;
    Check("OrientationCalc", module, plain);
}

int32_t Twin::Vote(int32_t timeOut) {
    const int32_t module = ::Voting(timeOut);
    Check("Voting", module, reference::Voting(timeOut));
    return module;
}

void Twin::Tune(const std::vector<uint8_t>& image, uint32_t gain20, uint32_t gain2C) {
    const int32_t module = ::_NAVI_Tune(image.data(), 0, 0, &m_dac, &gain20, &gain2C);
    const int32_t plain =
        reference::_NAVI_Tune(image.data(), 0, 0, &m_dacReference, &gain20, &gain2C);
    Check("_NAVI_Tune", module, plain);
    if (m_dac != m_dacReference)
        Differ("_NAVI_Tune: DC registers " + Number(m_dac) + " and " + Number(m_dacReference));
    CompareTuning("_NAVI_Tune");
}

void Twin::SetImage(const std::vector<uint8_t>& image) {
    std::memcpy(m_image.data(), image.data(), image.size());
    std::memcpy(m_imageReference.data(), image.data(), image.size());
}

void Twin::SetDac(uint32_t value) {
    m_dac = value;
    m_dacReference = value;
}

void Twin::SetPairCount(int32_t calc_cnt) {
    ::PrintNaviLog()->calc_cnt = calc_cnt;
    reference::PrintNaviLog()->calc_cnt = calc_cnt;
}

void Twin::FailAllocation(int32_t number, bool forGood) {
    m_failing = number;
    m_failingForGood = forGood;
}

bool Twin::ImageFits() {
    using namespace fpnavi;
    const auto fits = [](int32_t width, int32_t height) {
        return int64_t{width} * height <= static_cast<int64_t>(kImageBytes);
    };
    return fits(s_imageWidth, s_imageHeight) &&
           (s_modeFlag != 1 || fits(s_imageWidthHg, s_imageHeightHg));
}

void Twin::Differ(const std::string& what) {
    if (!m_difference)
        m_difference = "call " + Number(m_calls) + ": " + what;
}

void Twin::Check(const std::string& call, int32_t module, int32_t reference) {
    ++m_calls;
    if (module != reference)
        Differ(call + ": results " + Number(module) + " and " + Number(reference));
    CompareRecord(call);
    CompareFrames(call);
    CompareFlags(call);
    CompareLogs(call);
}

void Twin::CompareRecord(const std::string& call) {
    static_assert(sizeof(::NaviVoteInfo_t) == sizeof(reference::NaviVoteInfo_t));
    const auto* module = reinterpret_cast<const int32_t*>(::PrintNaviLog());
    const auto* plain = reinterpret_cast<const int32_t*>(reference::PrintNaviLog());
    for (size_t i = 0; i < sizeof(::NaviVoteInfo_t) / sizeof(int32_t); ++i) {
        if (module[i] != plain[i])
            return Differ(call + ": record differs at integer " + std::to_string(i) + ": " +
                          Number(module[i]) + " and " + Number(plain[i]));
    }
}

namespace {

template <typename A, typename B>
bool SameFrame(const A& a, const B& b) {
    if (a.width != b.width || a.height != b.height || a.cvr != b.cvr || a.range != b.range ||
        a.xc != b.xc || a.yc != b.yc || (a.pData == nullptr) != (b.pData == nullptr) ||
        (a.pType == nullptr) != (b.pType == nullptr))
        return false;
    const size_t size = static_cast<size_t>(a.width) * static_cast<size_t>(a.height);
    return a.pData == nullptr ||
           (std::memcmp(a.pData, b.pData, size) == 0 && std::memcmp(a.pType, b.pType, size) == 0);
}

}  // namespace

void Twin::CompareFrames(const std::string& call) {
    if (!SameFrame(fpnavi::s_imageCurr, reference::s_imageCurr))
        Differ(call + ": s_imageCurr differs");
    if (!SameFrame(fpnavi::s_imagePrev, reference::s_imagePrev))
        Differ(call + ": s_imagePrev differs");
    if (!SameFrame(fpnavi::s_fullImageCurr, reference::s_fullImageCurr))
        Differ(call + ": s_fullImageCurr differs");
    if (!SameFrame(fpnavi::s_fullImagePrev, reference::s_fullImagePrev))
        Differ(call + ": s_fullImagePrev differs");
}

void Twin::CompareImages(const std::string& call, size_t bytes) {
    if (std::memcmp(m_image.data(), m_imageReference.data(), std::min(bytes, kImageBytes)) != 0)
        Differ(call + ": the images differ");
}

void Twin::CompareFlags(const std::string& call) {
    if (fpnavi::s_frameNum != reference::s_frameNum)
        Differ(call + ": s_frameNum differs");
    if (fpnavi::s_lastFrameFlag != reference::s_lastFrameFlag)
        Differ(call + ": s_lastFrameFlag differs");
    if (fpnavi::s_tuneOkFlag != reference::s_tuneOkFlag)
        Differ(call + ": s_tuneOkFlag differs");
    if (fpnavi::s_doubleScanFlag != reference::s_doubleScanFlag)
        Differ(call + ": s_doubleScanFlag differs");
    if (fpnavi::s_imageWidth != reference::s_imageWidth ||
        fpnavi::s_imageHeight != reference::s_imageHeight ||
        fpnavi::s_fullImageWidth != reference::s_fullImageWidth ||
        fpnavi::s_fullImageHeight != reference::s_fullImageHeight)
        Differ(call + ": derived sizes differ");
    if (std::memcmp(fpnavi::DoubleScanZoneCurr, reference::DoubleScanZoneCurr, 64) != 0 ||
        std::memcmp(fpnavi::DoubleScanZonePrev, reference::DoubleScanZonePrev, 64) != 0)
        Differ(call + ": double-scan maps differ");
}

void Twin::CompareTuning(const std::string& call) {
#define COMPARE_TUNING(name)             \
    if (fpnavi::name != reference::name) \
    Differ(call + ": " #name " " + Number(fpnavi::name) + " and " + Number(reference::name))
    COMPARE_TUNING(_NAVI_dc_mode);
    COMPARE_TUNING(_NAVI_dc_current);
    COMPARE_TUNING(_NAVI_dc_residual);
    COMPARE_TUNING(_NAVI_dc_pre);
    COMPARE_TUNING(_NAVI_mean);
    COMPARE_TUNING(_NAVI_top_mean);
    COMPARE_TUNING(_NAVI_flag_effective);
    COMPARE_TUNING(_NAVI_flag_recommend);
    COMPARE_TUNING(_NAVI_flag_recommend_top);
    COMPARE_TUNING(_NAVI_flag_recommend_pre);
    COMPARE_TUNING(_NAVI_flag_non_linear);
    COMPARE_TUNING(_NAVI_G20C);
    COMPARE_TUNING(_NAVI_K_value);
    COMPARE_TUNING(_NAVI_delta_dc_val_top);
    COMPARE_TUNING(_NAVI_delta_dc_val_mean);
    COMPARE_TUNING(_NAVI_delta_dc_val);
    COMPARE_TUNING(_NAVI_delta_dc_orient);
    COMPARE_TUNING(_NAVI_NoMoreProcess);
    COMPARE_TUNING(_NAVI_TimeOut);
    COMPARE_TUNING(_NAVI_flag_param_reset);
    COMPARE_TUNING(sImgSizeInfo.iHeight);
    COMPARE_TUNING(sImgSizeInfo.iWidth);
#undef COMPARE_TUNING
    if (std::memcmp(fpnavi::_NAVI_img_histogram, reference::_NAVI_img_histogram,
                    sizeof fpnavi::_NAVI_img_histogram) != 0)
        Differ(call + ": _NAVI_img_histogram differs");
}

void Twin::CompareLogs(const std::string& call) {
    if (m_log != m_logReference) {
        const size_t common = std::min(m_log.size(), m_logReference.size());
        size_t i = 0;
        while (i < common && m_log[i] == m_logReference[i])
            ++i;
        Differ(call + ": log line " + std::to_string(i) + " differs: «" +
               (i < m_log.size() ? m_log[i] : "") + "» and «" +
               (i < m_logReference.size() ? m_logReference[i] : "") + "»");
    }
    m_log.clear();
    m_logReference.clear();
}

}  // namespace fpnavi_test
