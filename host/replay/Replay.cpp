#include "replay/Replay.h"

#include <fmt/core.h>

#include <algorithm>

#include "common/Error.h"
#include "gesture/Gesture.h"
#include "param/NaviParam.h"
#include "parameters/ParamTable.h"
#include "recording/Keys.h"
#include "store/Store.h"

namespace host {
namespace {

[[noreturn]] void Refuse(const Gesture& gesture, const std::string& source,
                         const std::string& problem) {
    throw Error(source, "gesture '" + gesture.id + "'", problem);
}

class Loop {
  public:
    Loop(const Gesture& gesture, const ReplayHooks& hooks)
        : m_gesture(gesture),
          m_hooks(hooks),
          m_image(gesture.frames.empty() ? 0 : gesture.frames.front().raw.size()) {}

    void Run(ReplayResult* result) {
        if (SetNaviParam(m_gesture.params.data()) != 0)
            result->errors.emplace_back("SetNaviParam returned -1");
        FpNaviClear();
        bool seen = false;
        bool left = false;
        for (size_t i = 0; i < m_gesture.frames.size() && !left; ++i) {
            const FrameCalls calls = Feed(i);
            Note(i, calls, &result->errors);
            result->calls.push_back(calls);
            if (m_hooks.afterFrame)
                m_hooks.afterFrame(i, calls);
            seen = seen || calls.status == 1;
            left = seen && calls.status == 0;
        }
        result->voteTimeOut = left ? 0 : 1;
        result->pairs = fpnavi::s_voteInfo.calc_cnt;
        result->key = Voting(result->voteTimeOut);
        if (result->key < 0)
            result->errors.emplace_back("Voting returned -1");
    }

  private:
    FrameCalls Feed(size_t i) {
        const RecordedFrame& frame = m_gesture.frames[i];
        FrameCalls calls;
        if (m_gesture.mode == Mode::DoubleScan)
            calls.doubleScan = GetDoubleScanNaviBlock(frame.reg24, frame.reg28);
        calls.block = GetNaviBlock(frame.raw.data(), m_gesture.geometry.Width(),
                                   m_gesture.geometry.Height(), m_image.data());
        if (calls.block != 0)
            return calls;
        calls.status = vmk_fp_navigation_detect_finger_status(m_image.data());
        if (m_hooks.beforeOrientation)
            m_hooks.beforeOrientation(i);
        calls.orientation = OrientationCalc(m_image.data(), m_image.data(), 0);
        return calls;
    }

    static void Note(size_t frame, const FrameCalls& calls, std::vector<std::string>* errors) {
        const auto note = [frame, errors](const char* call) {
            errors->push_back(fmt::format("frame {}: {} returned -1", frame, call));
        };
        if (calls.doubleScan < 0)
            note("GetDoubleScanNaviBlock");
        if (calls.block < 0) {
            note("GetNaviBlock");
            return;
        }
        if (calls.status < 0)
            note("vmk_fp_navigation_detect_finger_status");
        if (calls.orientation < 0)
            note("OrientationCalc");
    }

    const Gesture& m_gesture;
    const ReplayHooks& m_hooks;
    std::vector<uint8_t> m_image;
};

}  // namespace

// The hg finger test reads s_imageWidthHg x s_imageHeightHg bytes of the frame, whatever the
// frame's own size, and trusts the host that they are there.
std::string FingerTestProblem(const ParamBlock& params) {
    if (ModeOf(params) != Mode::Hg)
        return "";
    const Geometry g = GeometryOf(params);  // of any values: no integer holds all products
    const double size = double{1} * g.blockWidth * g.blockColNum * g.blockHeight * g.blockRowNum;
    const int64_t width = ParamValue(params, "s_imageWidthHg");
    const int64_t height = ParamValue(params, "s_imageHeightHg");
    if (width < 1 || height < 1 || static_cast<double>(width * height) <= size)
        return "";
    return fmt::format("s_imageWidthHg x s_imageHeightHg is {} pixels, but a frame has {:.0f}",
                       width * height, size);
}

ReplayResult ReplayHere(const Gesture& gesture, const ReplayHooks& hooks,
                        const std::string& source) {
    CheckGesture(gesture, source);
    const std::string problem = FingerTestProblem(gesture.params);
    if (!problem.empty())
        Refuse(gesture, source, problem);
    if (fpnavi::ScansTwice() && gesture.mode != Mode::DoubleScan)
        Refuse(gesture, source,
               fmt::format("this process has switched the double scan on; a gesture of "
                           "mode {} needs a process of its own",
                           ModeName(gesture.mode)));
    ReplayResult result = EmptyResult(gesture);
    Loop(gesture, hooks).Run(&result);
    if (result.errors.empty())
        result.verdict = JudgeKey(result.key, gesture.label, gesture.accepted);
    return result;
}

ReplayResult EmptyResult(const Gesture& gesture) {
    ReplayResult result;
    result.id = gesture.id;
    result.mode = gesture.mode;
    result.tier = gesture.tier;
    result.label = gesture.label;
    result.frameCount = static_cast<int32_t>(gesture.frames.size());
    return result;
}

Verdict JudgeKey(int32_t key, const std::optional<int32_t>& label,
                 const std::vector<int32_t>& accepted) {
    const auto lists = [&accepted](int32_t one) {
        return std::find(accepted.begin(), accepted.end(), one) != accepted.end();
    };
    if (label && key == *label)
        return Verdict::Right;
    if (!label && accepted.empty())
        return Verdict::Unknown;
    const bool valid = !label || lists(*label);
    return valid && lists(key) ? Verdict::Accepted : Verdict::Wrong;
}

const char* VerdictName(Verdict verdict) {
    switch (verdict) {
        case Verdict::Right:
            return "right";
        case Verdict::Accepted:
            return "accepted";
        case Verdict::Wrong:
            return "wrong";
        case Verdict::Unknown:
            return "unknown";
        default:
            return "unreadable";
    }
}

}  // namespace host
