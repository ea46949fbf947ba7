// The answers of a simulated gesture, from what is known of the motion alone: presence per frame,
// the true key, the keys that are no error, and whether the motion is plain enough to demand the
// key.
#ifndef FPNAVI_HOST_LABEL_H
#define FPNAVI_HOST_LABEL_H

#include <string>
#include <vector>

#include "simulator/Frame.h"
#include "simulator/Plan.h"

namespace host {

// What is true of one frame.
struct FrameTruth {
    FingerState finger;
    int32_t share = 0;          // contact, percent of the frame's pixels
    int32_t quadrantShare = 0;  // the same of the quadrant with the most contact
    bool touched = false;       // any contact at all, on a pixel or a zone
    int32_t zones = 0;          // bits set in the zone registers
    int32_t blobX16 = 0;        // centroid of the contact seen in the frame, 1/16 pixel
    int32_t blobY16 = 0;
};

// Contact of a frame of points, width to the row; zones and finger stay as they are.
void MeasureContact(const std::vector<SkinPoint>& points, int32_t width, FrameTruth& truth);

// Absent: nothing touches. Present: a fifth of the frame touches (fp), nearly half of one quadrant
// (hg, whose finger test looks for a dark quadrant), a quarter of the zones (double scan). Sliver:
// in between.
Presence PresenceOf(const FrameTruth& truth, Mode mode);

struct Answers {
    std::optional<int32_t> label;
    std::vector<int32_t> accepted;
    std::string tier;  // "core" or "hard"
    std::string kindTag;
};

// crossing: percent of the skin's grey gradient that lies along the motion; 100 when the ridges run
// across it, 0 when the skin looks the same all along it.
Answers JudgeGesture(const SimPlan& plan, const std::vector<FrameTruth>& frames, int32_t crossing);

// The direction key next to an angle of SimPlan.
int32_t KeyOfAngle(int32_t degrees);

}  // namespace host

#endif  // FPNAVI_HOST_LABEL_H
