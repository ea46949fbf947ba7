// Presence, labels and tiers of simulated gestures.
#include "simulator/Label.h"

#include <array>

namespace host {
namespace {

constexpr int32_t kPresentShare = 20;          // percent of the frame
constexpr int32_t kPresentQuadrantShare = 45;  // percent of a quadrant
constexpr int32_t kPresentZones = 16;          // of 64

// Bounds of a core gesture.
constexpr int32_t kGoodShare = 60;        // percent of the frame in contact
constexpr int32_t kLeastStep16 = 52;      // 3.25 pixels: 3.5 less the unevenness of the speed
constexpr int32_t kGreatestStep16 = 136;  // 8.5 pixels
constexpr int32_t kLeastGoodPairs = 4;
constexpr int32_t kLeastTravel16 = 20 * 16;  // over the good pairs
constexpr int32_t kLeastBlobTravel16 = 12 * 16;
constexpr int32_t kLeastCrossing = 25;  // percent of the gradient along the motion
// Skin that has moved by two pixels still counts as resting. The least change beyond that: crossing
// in percent times what remains of the step, in 1/16 pixel.
constexpr int32_t kRestStep16 = 32;
constexpr int32_t kLeastChange = 2200;

int32_t Abs(int32_t value) {
    return value < 0 ? -value : value;
}

const char* KeyName(int32_t key) {
    static constexpr std::array<const char*, 6> kNames = {"NONE",  "UP",   "DOWN",
                                                          "RIGHT", "LEFT", "NO_MOVE"};
    return kNames[static_cast<size_t>(key)];
}

int32_t OppositeKey(int32_t key) {
    switch (key) {
        case VKEY_UP:
            return VKEY_DOWN;
        case VKEY_DOWN:
            return VKEY_UP;
        case VKEY_RIGHT:
            return VKEY_LEFT;
        default:
            return VKEY_RIGHT;
    }
}

// The smaller component at most a fifth of the greater: within 12 degrees of an axis.
bool AlongAxis(int32_t x, int32_t y) {
    const int32_t greater = Abs(x) > Abs(y) ? Abs(x) : Abs(y);
    const int32_t smaller = Abs(x) > Abs(y) ? Abs(y) : Abs(x);
    return smaller * 5 <= greater;
}

int32_t KeyOfTravel(int32_t x, int32_t y) {
    if (Abs(x) > Abs(y))
        return x > 0 ? VKEY_RIGHT : VKEY_LEFT;
    return y > 0 ? VKEY_DOWN : VKEY_UP;
}

// Frames of good contact that move visibly, without a break.
bool IsPlainRidgeMotion(const std::vector<FrameTruth>& frames, int32_t key) {
    int32_t pairs = 0;
    int32_t x = 0;
    int32_t y = 0;
    for (size_t i = 1; i < frames.size(); ++i) {
        if (frames[i - 1].share < kGoodShare || frames[i].share < kGoodShare)
            continue;
        const int32_t dx = frames[i].finger.x16 - frames[i - 1].finger.x16;
        const int32_t dy = frames[i].finger.y16 - frames[i - 1].finger.y16;
        x += dx;
        y += dy;
        const int32_t step = Abs(dx) > Abs(dy) ? Abs(dx) : Abs(dy);
        if (step > kGreatestStep16)
            return false;
        pairs += step >= kLeastStep16 ? 1 : 0;
    }
    const int32_t travel = Abs(x) > Abs(y) ? Abs(x) : Abs(y);
    return pairs >= kLeastGoodPairs && travel >= kLeastTravel16 && AlongAxis(x, y) &&
           KeyOfTravel(x, y) == key;
}

// Once the finger is plainly there it stays so until it leaves for good.
bool IsUnbroken(const std::vector<FrameTruth>& frames, Mode mode) {
    int32_t changes = 0;
    bool present = false;
    for (const FrameTruth& frame : frames) {
        const bool now = PresenceOf(frame, mode) == Presence::Present;
        changes += now != present ? 1 : 0;
        present = now;
    }
    return changes <= 2;
}

// The patch itself is seen to move across the window.
bool IsPlainBlobMotion(const std::vector<FrameTruth>& frames, int32_t key) {
    const FrameTruth* first = nullptr;
    const FrameTruth* last = nullptr;
    for (const FrameTruth& frame : frames) {
        if (PresenceOf(frame, Mode::Hg) == Presence::Present) {
            first = first == nullptr ? &frame : first;
            last = &frame;
        }
    }
    if (first == nullptr)
        return false;
    const int32_t x = last->blobX16 - first->blobX16;
    const int32_t y = last->blobY16 - first->blobY16;
    const int32_t travel = Abs(x) > Abs(y) ? Abs(x) : Abs(y);
    return travel >= kLeastBlobTravel16 && AlongAxis(x, y) && KeyOfTravel(x, y) == key;
}

bool IsPlainMotion(const SimPlan& plan, const std::vector<FrameTruth>& frames, int32_t key,
                   int32_t crossing) {
    if (plan.kind != SimKind::Stroke || plan.skin == SkinState::Wet ||
        !IsUnbroken(frames, plan.mode))
        return false;
    if (plan.mode == Mode::Hg)
        return IsPlainBlobMotion(frames, key);
    // What changes from frame to frame grows with the step and with the gradient along it.
    return crossing >= kLeastCrossing && crossing * (plan.speed16 - kRestStep16) >= kLeastChange &&
           IsPlainRidgeMotion(frames, key);
}

// The second direction of a diagonal.
int32_t SideKey(int32_t degrees, int32_t key) {
    const bool horizontal = key == VKEY_RIGHT || key == VKEY_LEFT;
    if (horizontal)
        return degrees < 180 ? VKEY_UP : VKEY_DOWN;
    return degrees < 90 || degrees > 270 ? VKEY_RIGHT : VKEY_LEFT;
}

Answers JudgeTwoKeys(SimKind kind, int32_t key, int32_t other) {
    const bool otherFirst = kind == SimKind::Diagonal && (key == VKEY_UP || key == VKEY_DOWN);
    const int32_t first = otherFirst ? other : key;
    const int32_t second = otherFirst ? key : other;
    Answers answers;
    answers.accepted = {first, second, VKEY_NO_MOVE, VKEY_NONE};
    answers.tier = "hard";
    answers.kindTag = std::string(SimKindName(kind)) + ":" + KeyName(first) + "_" + KeyName(second);
    return answers;
}

}  // namespace

void MeasureContact(const std::vector<SkinPoint>& points, int32_t width, FrameTruth& truth) {
    const auto count = static_cast<int32_t>(points.size());
    const int32_t height = count / width;
    std::array<int32_t, 4> quadrants{};
    int32_t sum = 0;
    int64_t x = 0;
    int64_t y = 0;
    for (int32_t i = 0; i < count; ++i) {
        const int32_t contact = points[static_cast<size_t>(i)].contact;
        const int32_t column = i % width;
        const int32_t row = i / width;
        sum += contact;
        x += static_cast<int64_t>(contact) * column;
        y += static_cast<int64_t>(contact) * row;
        const int32_t quadrant = (column * 2 >= width ? 1 : 0) + (row * 2 >= height ? 2 : 0);
        quadrants[static_cast<size_t>(quadrant)] += contact;
    }
    truth.touched = truth.touched || sum > 0;
    truth.share = sum / 255 * 100 / count;
    int32_t most = 0;
    for (const int32_t quadrant : quadrants)
        most = quadrant > most ? quadrant : most;
    truth.quadrantShare = most / 255 * 400 / count;
    truth.blobX16 = sum == 0 ? 0 : static_cast<int32_t>(x * kSubPixels / sum);
    truth.blobY16 = sum == 0 ? 0 : static_cast<int32_t>(y * kSubPixels / sum);
}

Presence PresenceOf(const FrameTruth& truth, Mode mode) {
    if (!truth.touched)
        return Presence::Absent;
    bool present = false;
    switch (mode) {
        case Mode::Fp:
            present = truth.share >= kPresentShare;
            break;
        case Mode::Hg:
            present = truth.quadrantShare >= kPresentQuadrantShare;
            break;
        case Mode::DoubleScan:
            present = truth.zones >= kPresentZones;
            break;
    }
    return present ? Presence::Present : Presence::Sliver;
}

int32_t KeyOfAngle(int32_t degrees) {
    static constexpr std::array<int32_t, 4> kKeys = {VKEY_RIGHT, VKEY_UP, VKEY_LEFT, VKEY_DOWN};
    const int32_t turn = (degrees % 360 + 360 + 45) % 360;
    return kKeys[static_cast<size_t>(turn / 90)];
}

Answers JudgeGesture(const SimPlan& plan, const std::vector<FrameTruth>& frames, int32_t crossing) {
    Answers answers;
    if (IsResting(plan.kind)) {
        answers.label = VKEY_NO_MOVE;
        answers.accepted = {VKEY_NO_MOVE, VKEY_NONE};
        answers.tier = plan.skin == SkinState::Normal ? "core" : "hard";
        answers.kindTag = SimKindName(plan.kind);
        return answers;
    }
    const int32_t key = KeyOfAngle(plan.angle);
    if (plan.kind == SimKind::Diagonal)
        return JudgeTwoKeys(plan.kind, key, SideKey((plan.angle % 360 + 360) % 360, key));
    if (plan.kind == SimKind::Reversal)
        return JudgeTwoKeys(plan.kind, key, OppositeKey(key));
    answers.kindTag = std::string(SimKindName(plan.kind)) + ":" + KeyName(key);
    if (plan.kind != SimKind::Small)
        answers.label = key;
    if (IsPlainMotion(plan, frames, key, crossing)) {
        answers.tier = "core";
        answers.accepted = {key};
    } else {
        answers.tier = "hard";
        answers.accepted = {key, VKEY_NO_MOVE, VKEY_NONE};
    }
    return answers;
}

}  // namespace host
