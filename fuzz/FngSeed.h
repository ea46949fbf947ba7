// Writes .fng recordings, byte by byte as docs/recordings.md tells the format.
#ifndef FUZZ_FNGSEED_H
#define FUZZ_FNGSEED_H

#include <string>

#include "recording/Recording.h"

namespace fpnavi_fuzz {

// The file of gesture, whose geometry is the default of its mode. tiled: the layout that the header
// tells. blocks: with each frame in sensor order too.
std::string FngBytes(const host::Gesture& gesture, bool tiled, bool blocks);

}  // namespace fpnavi_fuzz

#endif  // FUZZ_FNGSEED_H
