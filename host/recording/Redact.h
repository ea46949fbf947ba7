// Takes the fingerprint out of a recording, so that it can be shared as a description of what
// happened.
#ifndef FPNAVI_HOST_REDACT_H
#define FPNAVI_HOST_REDACT_H

#include "recording/Recording.h"

namespace host {

// The tag that Redact adds.
inline constexpr const char* kRedactedTag = "redacted";

// Replaces every byte of each frame by the frame's mean grey: no ridge, pore or outline survives.
// Keeps everything else (registers are a map of 8 x 8 contact bits, too coarse for a ridge) and
// adds the tag once. Write the result into a new store: a changed row of an old one would leave
// the former bytes in the file's free pages.
void Redact(Gesture& gesture);

}  // namespace host

#endif  // FPNAVI_HOST_REDACT_H
