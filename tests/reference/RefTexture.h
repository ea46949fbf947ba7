// The texture test of fpnavi::finger_detect, pixel by pixel. On its own: what the model calls is
// whatever reference::FingerBLKTest points to.
#ifndef REFERENCE_REFTEXTURE_H
#define REFERENCE_REFTEXTURE_H

#include <cstdint>

namespace reference {

// As FingerBLKTest of FingerDetect.h, with this project's limits and unit.
void TextureTest(const uint8_t* image, int32_t width, int32_t height, int32_t* results,
                 int32_t mode);

}  // namespace reference

#endif  // REFERENCE_REFTEXTURE_H
