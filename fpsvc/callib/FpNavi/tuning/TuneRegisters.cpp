#include "tuning/TuneRegisters.h"

#include "base/NaviMath.h"
#include "param/NaviParam.h"

namespace fpnavi {
namespace {

constexpr uint32_t kDcAsDifference = 0;  // of the bytes of each half
constexpr uint32_t kDcInLowByte = 1;
constexpr uint32_t kByteMask = 0xFF;
constexpr uint32_t kGainFieldMax = 7;  // the amplifiers have eight steps

// Amplification at each step: tenths for the first pair of stages, units for the others.
constexpr int32_t _NAVI_gain_ratio_21[] = {10, 20, 40, 56, 70, 80, 112, 140};
constexpr int32_t _NAVI_gain_ratio_43[] = {1, 2, 3, 4, 5, 6, 7, 8};

// The fields of a packed gain code that enter the gain factor.
struct GainFields {
    uint32_t first;   // bits 12 to 15, a step of _NAVI_gain_ratio_21
    uint32_t second;  // bits 4 to 7, a step of _NAVI_gain_ratio_43
    uint32_t third;   // bits 0 to 3, likewise
};

GainFields SplitGainCode(uint32_t code) {
    return {code >> 12 & 0xFU, code >> 4 & 0xFU, code & 0xFU};
}

bool FieldsUsable(const GainFields& fields) {
    return fields.first <= kGainFieldMax && fields.second <= kGainFieldMax &&
           fields.third <= kGainFieldMax;
}

// factor times the ratios of the fields, wrapping.
int32_t Amplify(int32_t factor, const GainFields& fields) {
    return WrapMul(WrapMul(WrapMul(factor, _NAVI_gain_ratio_21[fields.first]),
                           _NAVI_gain_ratio_43[fields.third]),
                   _NAVI_gain_ratio_43[fields.second]);
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
    return FieldsUsable(SplitGainCode(g)) &&
           FieldsUsable(SplitGainCode(static_cast<uint32_t>(_NAVI_GAIN_REF)));
}

int32_t _NAVI_K_CALC(uint32_t g) {
    const int32_t input_k_g_r = Amplify(_NAVI_INPUT_K, SplitGainCode(g));
    const int32_t reference =
        Amplify(1, SplitGainCode(static_cast<uint32_t>(_NAVI_GAIN_REF)));  // 10..8960
    return input_k_g_r / reference;
}

}  // namespace fpnavi
