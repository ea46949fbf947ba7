// The calibration loop of a host.
#include "replay/TuneRun.h"

#include <fmt/core.h>

#include "FpNavi.h"
#include "common/Error.h"
#include "param/NaviParam.h"
#include "tuning/Tune.h"

namespace host {
namespace {

constexpr int32_t kSideMax = 4096;
constexpr int32_t kDcMax = 255;

// Block sizes and counts of up to kSideMax each, so that no product overflows.
void CheckGeometry(const Geometry& geometry, const std::string& source) {
    const auto sane = [](int32_t size, int32_t count) {
        return size >= 1 && count >= 1 && size <= kSideMax && count <= kSideMax &&
               size * count <= kSideMax;
    };
    if (!sane(geometry.blockWidth, geometry.blockColNum) ||
        !sane(geometry.blockHeight, geometry.blockRowNum))
        throw Error(source, "parameters",
                    fmt::format("blocks of {} x {} pixels, {} x {} of them; expected image sides "
                                "of 1 to {}",
                                geometry.blockWidth, geometry.blockHeight, geometry.blockColNum,
                                geometry.blockRowNum, kSideMax));
}

// The DC that the module takes a register to hold: in the layouts without one, what it remembers.
int32_t DcNow(uint32_t value) {
    return DcOfRegister(fpnavi::iDCMode, value, static_cast<int32_t>(fpnavi::_NAVI_dc_current));
}

void ReadState(TuneCall* call) {
    call->mean = fpnavi::_NAVI_mean;
    call->topGrey = static_cast<int32_t>(fpnavi::_NAVI_top_mean);
    call->gainFactor = fpnavi::_NAVI_K_value;
    call->effective = fpnavi::_NAVI_flag_effective;
    call->recommended = fpnavi::_NAVI_flag_recommend;
    call->recommendedTop = fpnavi::_NAVI_flag_recommend_top;
    call->saturated = fpnavi::_NAVI_flag_non_linear != 0;
    call->direction = fpnavi::_NAVI_delta_dc_orient;
    call->step = fpnavi::_NAVI_delta_dc_val;
    call->noMoreProcess = fpnavi::_NAVI_NoMoreProcess;
}

TuneEnd EndOf(const TuneCall& call) {
    if (call.result < 0)
        return TuneEnd::Failed;
    if (call.result == 0)
        return TuneEnd::Unfinished;
    if (fpnavi::IsHg())
        return TuneEnd::NotNeeded;
    if (call.effective == 0)
        return TuneEnd::InBand;
    if (call.noMoreProcess > 1)
        return TuneEnd::CallLimit;
    // Not by the direction: the first call of a run has cleared it by now.
    const bool atTop = call.recommended == -1 && call.dcBefore == kDcMax;
    const bool atBottom = call.recommended == 1 && call.dcBefore == fpnavi::_NAVI_DC_REF;
    return atTop || atBottom ? TuneEnd::AtLimit : TuneEnd::NoStep;
}

TuneCall CallOnce(const TuneSetup& setup, const Geometry& geometry, uint32_t dac,
                  const std::vector<uint8_t>& raw) {
    TuneCall call;
    call.registerBefore = call.registerAfter = dac;
    call.dcBefore = DcNow(dac);
    call.measured = !fpnavi::IsHg() && call.dcBefore >= fpnavi::_NAVI_DC_REF;
    std::vector<uint8_t> image(raw.size());
    call.result = GetNaviBlock(raw.data(), geometry.Width(), geometry.Height(), image.data());
    if (call.result == 0)
        call.result = _NAVI_Tune(image.data(), geometry.Width(), geometry.Height(),
                                 &call.registerAfter, &setup.gain20, &setup.gain2C);
    call.dcAfter = DcNow(call.registerAfter);
    ReadState(&call);
    return call;
}

}  // namespace

const char* TuneEndName(TuneEnd end) {
    switch (end) {
        case TuneEnd::InBand:
            return "in band";
        case TuneEnd::AtLimit:
            return "at limit";
        case TuneEnd::CallLimit:
            return "call limit";
        case TuneEnd::NoStep:
            return "no step";
        case TuneEnd::NotNeeded:
            return "not needed";
        case TuneEnd::Unfinished:
            return "unfinished";
        default:
            return "failed";
    }
}

TuneRun RunTuning(const TuneSetup& setup, const FrameSource& grab, const std::string& source) {
    const Geometry geometry = GeometryOf(setup.params);
    CheckGeometry(geometry, source);
    SetNaviParam(setup.params.data());
    const auto frameSize = static_cast<size_t>(geometry.Width() * geometry.Height());
    TuneRun run;
    run.lastRegister = setup.start;
    while (run.end == TuneEnd::Unfinished &&
           run.calls.size() < static_cast<size_t>(setup.maxCalls)) {
        const std::vector<uint8_t> raw = grab(run.lastRegister);
        if (raw.empty())
            break;
        if (raw.size() != frameSize)
            throw Error(source, fmt::format("frame {}", run.calls.size()),
                        fmt::format("{} bytes, expected {} ({} x {})", raw.size(), frameSize,
                                    geometry.Width(), geometry.Height()));
        run.calls.push_back(CallOnce(setup, geometry, run.lastRegister, raw));
        run.lastRegister = run.calls.back().registerAfter;
        run.end = EndOf(run.calls.back());
    }
    return run;
}

int32_t DcOfRegister(int32_t layout, uint32_t value, int32_t fallback) {
    if (layout == 1)
        return static_cast<int32_t>(value & 0xFFU);
    if (layout == 0)
        return static_cast<int32_t>((value >> 8) & 0xFFU) - static_cast<int32_t>(value & 0xFFU);
    return fallback;
}

uint32_t RegisterOfDc(int32_t layout, int32_t dc, uint32_t value) {
    const auto byte = static_cast<uint32_t>(dc) & 0xFFU;
    if (layout == 1)
        return (value & ~0xFFU) | byte;
    if (layout == 0) {
        const uint32_t pair = 0xFF00U | (255U - byte);
        return (pair << 16) | pair;
    }
    return value;
}

}  // namespace host
