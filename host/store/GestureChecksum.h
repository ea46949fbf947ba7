// The checksum that a store keeps with each gesture, so that a flipped bit is told.
#ifndef FPNAVI_HOST_GESTURECHECKSUM_H
#define FPNAVI_HOST_GESTURECHECKSUM_H

#include "recording/Recording.h"

namespace host {

// CRC-32 (that of zlib and PNG) of everything in gesture: id, parameters, frames with registers and
// positions, outcome, tags, notes. Any one flipped bit changes it, and any run of up to 32.
uint32_t GestureChecksum(const Gesture& gesture);

}  // namespace host

#endif  // FPNAVI_HOST_GESTURECHECKSUM_H
