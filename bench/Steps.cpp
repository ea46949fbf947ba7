// Written once as templates over the side. What a step finds is what OrientationCalc would leave
// it: a loaded frame for pre-processing, a whole processed pair for the motion methods.
#include "Steps.h"

#include <cstring>

#include "Sides.h"

namespace bench {
namespace {

template <class Side>
struct StepsOf {
    static inline int32_t s_thr = 0;
    static inline int32_t s_scale = 0;
    static inline int32_t s_match[3] = {};
    static inline int32_t* s_di = nullptr;
    static inline int32_t* s_dj = nullptr;

    static void Nothing() {}

    static void Clear(const FramePair&) { Side::FpNaviClear(); }
    static void First(const FramePair& pair) {
        Side::FpNaviClear();
        Side::OrientationCalc(pair.first.image.data());
    }
    static void Second(const FramePair& pair) { Side::OrientationCalc(pair.second.image.data()); }
    static void FirstScanned(const FramePair& pair) {
        Side::FpNaviClear();
        Side::TakeRegisters(pair.first.reg24, pair.first.reg28);
        Side::OrientationCalc(pair.first.image.data());
        Side::TakeRegisters(pair.second.reg24, pair.second.reg28);
    }
    static void FirstAlone(const FramePair& pair) {
        Side::OrientationCalc(pair.first.image.data());
    }

    static void Loaded(const FramePair& pair) {
        Side::FpNaviClear();
        Side::Load(pair.second.image.data());
    }
    static void Threshold(const FramePair&) { Side::CalcBiThr(&s_thr, &s_scale); }
    static void Thresholded(const FramePair& pair) {
        Loaded(pair);
        Threshold(pair);
    }
    static void Fill(const FramePair&) { Side::GetFingerRidge(s_thr); }
    static void Filled(const FramePair& pair) {
        Thresholded(pair);
        Fill(pair);
    }
    static void Stretch(const FramePair&) { Side::StretchRange(); }

    static void Both(const FramePair& pair) {
        First(pair);
        Second(pair);
    }
    static void Centroid(const FramePair&) { Side::GetCenterAndCoverage(); }
    static void NoMove(const FramePair&) { Side::FingerNoMove(); }
    static void WithArrays(const FramePair& pair) {
        Both(pair);
        const size_t bytes = static_cast<size_t>(Side::CandidateNum()) * sizeof(int32_t);
        s_di = static_cast<int32_t*>(std::malloc(bytes));
        s_dj = static_cast<int32_t*>(std::malloc(bytes));
    }
    static void Candidates(const FramePair&) { Side::FindCandidate(s_di, s_dj); }
    static void WithCandidates(const FramePair& pair) {
        WithArrays(pair);
        Candidates(pair);
    }
    static void FullImages(const FramePair&) { Side::GetFullImg(); }
    static void Match(const FramePair&) { Side::FindMatch(s_di, s_dj, s_match); }
    static void Free() {
        std::free(s_di);
        std::free(s_dj);
    }
    static void FreeAfterMatch() {
        if (!Side::kFindMatchFrees)
            Free();
    }
    static void Joint(const FramePair&) { Side::CalcImgJoint(); }
    static void Presence(const FramePair& pair) { Side::FingerStatus(pair.second.image.data()); }
};

using P = StepsOf<Plain>;
using S = StepsOf<Shipped>;

// The step of both sides.
#define STEP(prepare, run, finish)        \
    {&P::prepare, &P::run, &P::finish}, { \
        &S::prepare, &S::run, &S::finish  \
    }

template <class Side>
int32_t Replay(PairKind kind, const FramePair& pair) {
    if (kind == PairKind::DoubleScan)
        StepsOf<Side>::FirstScanned(pair);
    else
        StepsOf<Side>::First(pair);
    return Side::OrientationCalc(pair.second.image.data());
}

}  // namespace

const std::vector<Comparison>& Comparisons() {
    static const std::vector<Comparison> all = {
        {"threshold", PairKind::Moved, Unit::FramePixel, false, STEP(Loaded, Threshold, Nothing)},
        {"fill", PairKind::Moved, Unit::FramePixel, false, STEP(Thresholded, Fill, Nothing)},
        {"stretch", PairKind::Moved, Unit::FramePixel, false, STEP(Filled, Stretch, Nothing)},
        {"centroid", PairKind::Moved, Unit::FramePixel, false, STEP(Both, Centroid, Nothing)},
        {"no-move test", PairKind::Moved, Unit::FramePixel, false, STEP(Both, NoMove, Nothing)},
        {"no-move test, still", PairKind::Still, Unit::FramePixel, false,
         STEP(Both, NoMove, Nothing)},
        {"candidates", PairKind::Moved, Unit::Placement, false, STEP(WithArrays, Candidates, Free)},
        {"full images", PairKind::Moved, Unit::FramePixel, false, STEP(Both, FullImages, Nothing)},
        {"match, any size", PairKind::Moved, Unit::Match, false,
         STEP(WithCandidates, Match, FreeAfterMatch)},
        {"candidates to match", PairKind::Moved, Unit::Joint, false, STEP(Both, Joint, Nothing)},
        {"presence, fp", PairKind::Moved, Unit::FramePixel, false, STEP(Clear, Presence, Nothing)},
        {"presence, hg", PairKind::Hg, Unit::FramePixel, false, STEP(Clear, Presence, Nothing)},
        {"pair, moved", PairKind::Moved, Unit::None, true, STEP(First, Second, Nothing)},
        {"pair, still", PairKind::Still, Unit::FramePixel, true, STEP(First, Second, Nothing)},
        {"first frame", PairKind::Moved, Unit::FramePixel, true, STEP(Clear, FirstAlone, Nothing)},
        {"pair, hg", PairKind::Hg, Unit::FramePixel, true, STEP(First, Second, Nothing)},
        {"first frame, hg", PairKind::Hg, Unit::FramePixel, true, STEP(Clear, FirstAlone, Nothing)},
        {"pair, double scan", PairKind::DoubleScan, Unit::None, true,
         STEP(FirstScanned, Second, Nothing)},
    };
    return all;
}

#undef STEP

void SetBothParams(const int32_t* params) {
    reference::FingerBLKTest = ::FingerBLKTest;
    Plain::SetNaviParam(params);
    Shipped::SetNaviParam(params);
}

bool SameRecords(PairKind kind, const FramePair& pair) {
    const int32_t plain = Replay<Plain>(kind, pair);
    const int32_t shipped = Replay<Shipped>(kind, pair);
    return plain == shipped &&
           std::memcmp(Plain::Record(), Shipped::Record(), sizeof(NaviVoteInfo_t)) == 0;
}

}  // namespace bench
