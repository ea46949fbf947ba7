#include "tuning/TuneRegisters.h"

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr uint32_t kDcAsDifference = 0;  // of the bytes of each half
constexpr uint32_t kDcInLowByte = 1;
constexpr uint32_t kByteMask = 0xFF;

// Amplification at each step: tenths for the first pair of stages, units for the others.
constexpr int32_t _NAVI_gain_ratio_21[] = {10, 20, 40, 56, 70, 80, 112, 140};
constexpr int32_t _NAVI_gain_ratio_43[] = {1, 2, 3, 4, 5, 6, 7, 8};

// Set in a field above 7, of the three fields that enter the gain factor.
constexpr uint32_t kBeyondTables = 0x8088;

// Amplification at the packed gain code g in tenths, 10..8960.
int32_t Ratio(uint32_t g) {
    return _NAVI_gain_ratio_21[g >> 12 & 0xFU] * _NAVI_gain_ratio_43[g >> 4 & 0xFU] *
           _NAVI_gain_ratio_43[g & 0xFU];
}

}  // namespace

uint32_t DecodeDc(uint32_t mode, uint32_t value, uint32_t otherwise) {
    if (mode == kDcInLowByte)
        return value & kByteMask;
    if (mode == kDcAsDifference)
        return WrapSubU(value >> 8 & kByteMask, value & kByteMask);
    return otherwise;
}

uint32_t DecodeResidual(uint32_t mode, uint32_t value, uint32_t otherwise) {
    return mode == kDcInLowByte ? value & ~kByteMask : otherwise;
}

uint32_t EncodeDc(uint32_t mode, uint32_t dc, uint32_t residual, uint32_t value) {
    if (mode == kDcInLowByte)
        return WrapAddU(dc, residual);
    if (mode == kDcAsDifference) {
        // Bytes 0 and 2 become 255 - DC, bytes 1 and 3 255.
        const uint32_t upper = WrapMulU(WrapSubU(kDcMax, dc), 1U << 16);
        return WrapAddU(WrapSubU(0xFF00FFFFU, dc), upper);
    }
    return value;
}

uint32_t PackGainCode(uint32_t gain20, uint32_t gain2C) {
    return (gain2C & 0xFU) | (gain2C >> 8 & 0xFU) << 4 | (gain20 >> 8 & 0xFU) << 8 |
           (gain20 >> 16 & 0xFU) << 12;
}

bool GainCodesUsable(uint32_t g) {
    return ((g | static_cast<uint32_t>(_NAVI_GAIN_REF)) & kBeyondTables) == 0;
}

int32_t _NAVI_K_CALC(uint32_t g) {
    return WrapMul(_NAVI_INPUT_K, Ratio(g)) / Ratio(static_cast<uint32_t>(_NAVI_GAIN_REF));
}

}  // namespace fpnavi
