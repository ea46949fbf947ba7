// Tuning, the registers: what the values of the DC register and of both gain registers say. Owns
// nothing; reads the parameters _NAVI_INPUT_K and _NAVI_GAIN_REF.
#ifndef FPNAVI_TUNEREGISTERS_H
#define FPNAVI_TUNEREGISTERS_H

#include <cstdint>

namespace fpnavi {

inline constexpr uint32_t kDcMax = 255;          // the DC field has 8 bits
inline constexpr int32_t _NAVI_ENLARGE_K = 100;  // gain factors are in hundredths

// mode, here and below: the layout of the DC register as iDCMode names it. 1: the DC is the low
// byte; 0: the DC is byte 1 - byte 0; any other: the register holds no DC.

// The DC that value holds, or otherwise where it holds none.
uint32_t DecodeDc(uint32_t mode, uint32_t value, uint32_t otherwise);

// The bits of value above the DC byte in mode 1, or otherwise in any other mode.
uint32_t DecodeResidual(uint32_t mode, uint32_t value, uint32_t otherwise);

// The register with dc, in mode 1 above it residual; value itself where it holds no DC.
uint32_t EncodeDc(uint32_t mode, uint32_t dc, uint32_t residual, uint32_t value);

// Packs the four gain fields of the two registers' values.
uint32_t PackGainCode(uint32_t gain20, uint32_t gain2C);

// The gain fields that _NAVI_K_CALC reads, of g and of _NAVI_GAIN_REF, lie in its tables.
bool GainCodesUsable(uint32_t g);

// Grey levels per DC step, in hundredths, at the packed gain code g: _NAVI_INPUT_K, which holds at
// the code _NAVI_GAIN_REF, scaled by the amplifiers' ratios. GainCodesUsable(g) holds.
int32_t _NAVI_K_CALC(uint32_t g);

}  // namespace fpnavi

#endif  // FPNAVI_TUNEREGISTERS_H
