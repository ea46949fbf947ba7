// The checksum that a store keeps with each gesture, so that a flipped bit is told.
#ifndef FPNAVI_HOST_GESTURECHECKSUM_H
#define FPNAVI_HOST_GESTURECHECKSUM_H

#include "recording/Recording.h"

namespace host {

// CRC-32 (that of zlib and PNG) of what was recorded: id, parameters, frames with registers and
// positions, end, version of the library. Any one flipped bit changes it, and any run of up to 32.
// What people say of a gesture is left out, so that plain SQL may change it: label, accepted keys,
// tier, tags, notes.
uint32_t GestureChecksum(const Gesture& gesture);

}  // namespace host

#endif  // FPNAVI_HOST_GESTURECHECKSUM_H
