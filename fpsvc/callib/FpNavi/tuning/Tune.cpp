#include "tuning/Tune.h"

#include "base/NaviMath.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"
#include "tuning/TuneRegisters.h"

namespace fpnavi {
namespace {

constexpr uint32_t kDcPreReset = 4095;  // no DC value

uint32_t RegisterNow(uint32_t value) {
    return EncodeDc(_NAVI_dc_mode, s_dc.current, _NAVI_dc_residual, value);
}

// A frame that cannot be measured gets a mean of 0; all other values stay those of the frame
// before.
void Measure(const uint8_t* img, uint32_t gainCode) {
    if (const auto measured = MeasureFrame(img, sImgSizeInfo, gainCode))
        s_reading = *measured;
    else
        s_reading.mean = 0;
}

// What the next call is to know of this one; value: the register that was in the sensor.
void Remember(uint32_t value) {
    s_dc.recommendPre = s_reading.recommend;
    if (_NAVI_flag_param_reset != 0) {
        s_dc.recommendPre = 3;
        s_dc.pre = kDcPreReset;
        s_dc.step = 0;
        s_dc.orient = 0;
        _NAVI_flag_param_reset = 0;
    }
    s_dc.pre = DecodeDc(_NAVI_dc_mode, value, s_dc.pre);
}

bool IsComplete() {
    return (s_dc.noMoreProcess <= 1 && _NAVI_TimeOut > 0) ||
           (_NAVI_TimeOut_threshold > 0 && _NAVI_TimeOut >= _NAVI_TimeOut_threshold);
}

}  // namespace

int32_t _NAVI_ImgHistogram(const uint8_t* img, int32_t height, int32_t width) {
    s_reading.mean = 0;
    return MeasureCorner(img, height, width, &s_reading) ? 0 : -1;
}

void _NAVI_GetDelta() {
    s_dc = SizeStep(s_dc, s_reading);
}

void _NAVI_Change0C() {
    s_dc = ApplyStep(s_dc, s_reading.effective, _NAVI_DC_REF);
}

}  // namespace fpnavi

int32_t _NAVI_Tune(const uint8_t* img, int32_t /*img_width*/, int32_t /*img_height*/,
                   uint32_t* iTuneDAC, const uint32_t* iGain20, const uint32_t* iGain2C) {
    using namespace fpnavi;
    if (img == nullptr || iTuneDAC == nullptr || iGain20 == nullptr || iGain2C == nullptr)
        return -1;
    if (IsHg())
        return 1;
    _NAVI_TimeOut = WrapAdd(_NAVI_TimeOut, 1);
    sImgSizeInfo = {s_imageHeight, s_imageWidth};
    s_tuneOkFlag = 0;
    _NAVI_dc_mode = static_cast<uint32_t>(iDCMode);
    s_dc.current = DecodeDc(_NAVI_dc_mode, *iTuneDAC, s_dc.current);
    _NAVI_dc_residual = DecodeResidual(_NAVI_dc_mode, *iTuneDAC, _NAVI_dc_residual);
    // A DC below its range is set to the middle, and nothing is measured.
    if (static_cast<int32_t>(s_dc.current) < _NAVI_DC_REF) {
        s_dc.current =
            static_cast<uint32_t>(WrapAdd(_NAVI_DC_REF, static_cast<int32_t>(kDcMax)) / 2);
        s_dc.noMoreProcess = 2;
        *iTuneDAC = RegisterNow(*iTuneDAC);
        return 0;
    }
    Measure(img, PackGainCode(*iGain20, *iGain2C));
    s_dc = DecideStep(s_dc, s_reading, _NAVI_DC_REF);
    Remember(*iTuneDAC);
    *iTuneDAC = RegisterNow(*iTuneDAC);
    if (IsComplete()) {
        s_tuneOkFlag = 1;
        _NAVI_TimeOut = 0;
        _NAVI_flag_param_reset = 1;
    }
    return s_tuneOkFlag;
}
