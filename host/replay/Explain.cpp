#include "replay/Explain.h"

#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "motion/CenterMove.h"
#include "motion/FingerNoMove.h"
#include "param/NaviParam.h"

namespace host {
namespace {

// Pair n writes n + 1 too, so the last entry is never a pair's own.
constexpr int32_t kPairMax = FPNAVI_VOTE_CAPACITY - 1;

// Coverage and centroid of a frame, measured on a copy of its record: the module measures a
// gesture's first frame only with the second.
NaviFrame_t Measured(NaviFrame_t frame) {
    if (fpnavi::GetCenterAndCoverage(&frame) != 0)
        frame.cvr = frame.xc = frame.yc = 0;
    return frame;
}

bool CoversLess(int32_t percent) {
    return Measured(fpnavi::s_imagePrev).cvr < percent ||
           Measured(fpnavi::s_imageCurr).cvr < percent;
}

SettledBy SettledFpPair() {
    const int32_t outcome = fpnavi::FingerNoMove(&fpnavi::s_imagePrev, &fpnavi::s_imageCurr);
    if (outcome == fpnavi::kNoMoveResting)
        return SettledBy::NoMoveTest;
    if (outcome == fpnavi::kNoMoveUndetermined)
        return SettledBy::NoMoveUndetermined;
    return CoversLess(fpnavi::s_coverageMinFp) ? SettledBy::TemplateCoverage
                                               : SettledBy::TemplateMatch;
}

class Tracer {
  public:
    explicit Tracer(const Gesture& gesture) : m_gesture(gesture) {}

    ReplayHooks Hooks() {
        ReplayHooks hooks;
        hooks.beforeOrientation = [this](size_t) {
            m_frameNumBefore = fpnavi::s_frameNum;
            m_pairsBefore = fpnavi::s_voteInfo.calc_cnt;
        };
        hooks.afterFrame = [this](size_t frame, const FrameCalls& calls) { Trace(frame, calls); };
        return hooks;
    }

    std::vector<FrameTrace> Take() { return std::move(m_frames); }

  private:
    void Trace(size_t frame, const FrameCalls& calls) {
        FrameTrace trace;
        trace.frame = frame;
        trace.status = calls.status;
        trace.settledBy = Settled(calls);
        if (trace.settledBy != SettledBy::Failed && trace.settledBy != SettledBy::NoFinger) {
            const NaviFrame_t current = Measured(fpnavi::s_imageCurr);
            trace.coverage = current.cvr;
            trace.xc = current.xc;
            trace.yc = current.yc;
            if (trace.settledBy != SettledBy::FirstFrame)
                ReadPair(&trace);
            m_taken = frame;
        }
        m_frames.push_back(trace);
    }

    SettledBy Settled(const FrameCalls& calls) const {
        if (calls.block != 0 || calls.orientation != 0)
            return SettledBy::Failed;
        if (fpnavi::s_frameNum == m_frameNumBefore)
            return SettledBy::NoFinger;
        if (fpnavi::s_frameNum == 1)
            return SettledBy::FirstFrame;
        if (fpnavi::s_voteInfo.calc_cnt == m_pairsBefore)
            return m_pairsBefore >= kPairMax ? SettledBy::RecordFull : SettledBy::CoverageMinimum;
        return fpnavi::IsHg() ? SettledBy::CentroidOnly : SettledFpPair();
    }

    void ReadPair(FrameTrace* trace) const {
        const NaviVoteInfo_t& record = fpnavi::s_voteInfo;
        const int32_t n = m_pairsBefore;
        trace->truth = Truth(trace->frame);
        if (trace->settledBy == SettledBy::RecordFull)
            return;
        if (fpnavi::ScansTwice())  // written before the coverage gate
            trace->doubleScan = {record.dx_ds[n], record.dy_ds[n], record.cvr_ds[n + 1]};
        if (trace->settledBy == SettledBy::CoverageMinimum)
            return;
        trace->pair = n;
        trace->centroid = {record.dx_ct[n], record.dy_ct[n], record.vkey_ct[n]};
        if (trace->settledBy == SettledBy::CentroidOnly ||
            trace->settledBy == SettledBy::TemplateCoverage)
            return;
        trace->fingerprint = {record.dx_fp[n], record.dy_fp[n], record.vkey_fp[n], std::nullopt};
        if (trace->settledBy == SettledBy::TemplateMatch)
            trace->fingerprint->difference = record.diff[n];
    }

    std::optional<TrueMove> Truth(size_t frame) const {
        const RecordedFrame& previous = m_gesture.frames[m_taken];
        const RecordedFrame& current = m_gesture.frames[frame];
        if (!previous.x16 || !previous.y16 || !current.x16 || !current.y16)
            return std::nullopt;
        // Positions grow downwards, displacements upwards.
        return TrueMove{(static_cast<double>(*current.x16) - *previous.x16) / 16,
                        (static_cast<double>(*previous.y16) - *current.y16) / 16};
    }

    const Gesture& m_gesture;
    std::vector<FrameTrace> m_frames;
    int32_t m_frameNumBefore = 0;
    int32_t m_pairsBefore = 0;
    size_t m_taken = 0;  // the frame that is now the module's current one
};

}  // namespace

Explanation ExplainHere(const Gesture& gesture, const std::string& source) {
    Tracer tracer(gesture);
    Explanation explanation;
    explanation.result = ReplayHere(gesture, tracer.Hooks(), source);
    explanation.frames = tracer.Take();
    return explanation;
}

const char* SettledByName(SettledBy settledBy) {
    switch (settledBy) {
        case SettledBy::NoFinger:
            return "no finger";
        case SettledBy::FirstFrame:
            return "first frame";
        case SettledBy::CoverageMinimum:
            return "coverage below minimum";
        case SettledBy::CentroidOnly:
            return "hg: centroid only";
        case SettledBy::NoMoveTest:
            return "no-move test";
        case SettledBy::NoMoveUndetermined:
            return "no-move undetermined";
        case SettledBy::TemplateCoverage:
            return "coverage below template minimum";
        case SettledBy::TemplateMatch:
            return "template match";
        case SettledBy::RecordFull:
            return "record full";
        default:
            return "failed";
    }
}

}  // namespace host
