// The replay loop: a recorded gesture through the module's calls, in the order in which a host
// service makes them, and the key it gives judged against the label.
//
// The module's state is file-level and the double scan, once on, stays on for the life of the
// process: see ReplayProcess.h for many gestures or gestures of several modes.
#ifndef FPNAVI_HOST_REPLAY_H
#define FPNAVI_HOST_REPLAY_H

#include <functional>
#include <string>
#include <vector>

#include "recording/Recording.h"

namespace host {

// What the calls for one frame returned.
struct FrameCalls {
    int32_t doubleScan = 0;   // GetDoubleScanNaviBlock; 0 too when it was not called
    int32_t block = 0;        // GetNaviBlock; after -1 the two calls below are not made
    int32_t status = -1;      // 1 finger present, 0 absent, -1 error
    int32_t orientation = 0;  // OrientationCalc
};

enum class Verdict : int32_t {
    Right = 0,       // the label
    Accepted = 1,    // not the label, but no error either
    Wrong = 2,       // any other key, or a call failed
    Unknown = 3,     // nobody knows which key is right
    Unreadable = 4,  // the gesture could not be read, or not be given to the module
};

inline constexpr size_t kVerdictCount = 5;

struct ReplayResult {
    std::string id;
    Mode mode = Mode::Fp;
    std::string tier;
    std::optional<int32_t> label;
    int32_t frameCount = 0;   // of the recording
    int32_t key = -1;         // what Voting returned
    int32_t pairs = 0;        // calc_cnt at the vote
    int32_t voteTimeOut = 0;  // what Voting was given
    Verdict verdict = Verdict::Wrong;
    std::vector<std::string> errors;  // one for each call that returned -1; a crash
    std::vector<FrameCalls> calls;    // of the frames that the module was given
};

// Watches a replay. Both may be empty; they may read the module's state, never write it.
struct ReplayHooks {
    std::function<void(size_t frame)> beforeOrientation;
    // After the frame's last call, before the vote.
    std::function<void(size_t frame, const FrameCalls& calls)> afterFrame;
};

// Replays gesture in this process. The vote comes at the first absent frame after a present one
// (time_out 0), or at the end of the recording (time_out 1) when the finger was never seen to
// leave. Throws Error when the gesture cannot be given to the module (frames, geometry and
// parameters that do not belong together), or when this process has switched the double scan on
// and the gesture is of another mode; source is what the Error names as the gesture's file.
ReplayResult ReplayHere(const Gesture& gesture, const ReplayHooks& hooks = {},
                        const std::string& source = "replay");

// What is wrong with the size of the hg finger test that params give; empty if nothing is.
std::string FingerTestProblem(const ParamBlock& params);

// What a result says of the gesture itself; no key, verdict wrong.
ReplayResult EmptyResult(const Gesture& gesture);

// Verdict on a key without failed calls: the one place where label and accepted keys get their
// meaning. accepted are the keys that are no error, a label among them; an accepted list without
// the label was made for another label, and does not count. Without both nothing is known.
Verdict JudgeKey(int32_t key, const std::optional<int32_t>& label,
                 const std::vector<int32_t>& accepted);

// "right", "accepted", "wrong", "unknown", "unreadable".
const char* VerdictName(Verdict verdict);

}  // namespace host

#endif  // FPNAVI_HOST_REPLAY_H
