#include "StepTestPair.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>

#include "Twin.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "matching/CandidateSearch.h"
#include "matching/DisplacementScore.h"
#include "matching/PairMatch.h"
#include "matching/PlacementScores.h"
#include "motion/CenterMove.h"
#include "motion/FingerNoMove.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::ParamBlock;
using host::ParamValue;
using host::SimRandom;

// What FillRoom takes.
int32_t s_roomJunk = kRandomJunk;

void LoadFrame(::NaviFrame_t* module, reference::NaviFrame_t* plain,
               const std::vector<uint8_t>& greys, const std::vector<uint8_t>& types) {
    const int32_t width = fpnavi::s_imageWidth;
    const int32_t height = fpnavi::s_imageHeight;
    ASSERT_EQ(greys.size(), (FrameSize{width, height}.Pixels()));
    ASSERT_EQ(types.size(), greys.size());
    ASSERT_EQ(fpnavi::ImgInit(module, 0, height, 0, width, greys.data()), 0);
    ASSERT_EQ(reference::ImgInit(plain, 0, height, 0, width, greys.data()), 0);
    std::memcpy(module->pType, types.data(), types.size());
    std::memcpy(plain->pType, types.data(), types.size());
    FillRoom(module, s_roomJunk);
}

void MeasurePair() {
    for (::NaviFrame_t* const frame : {&fpnavi::s_imagePrev, &fpnavi::s_imageCurr})
        ASSERT_EQ(fpnavi::GetCenterAndCoverage(frame), 0);
    for (reference::NaviFrame_t* const frame : {&reference::s_imagePrev, &reference::s_imageCurr})
        ASSERT_EQ(reference::GetCenterAndCoverage(frame), 0);
}

}  // namespace

void SetRoomJunk(int32_t value) {
    s_roomJunk = value;
}

void SetStepParams(const ParamBlock& params) {
    Twin::Get().SetParam(&params);
}

void SetStepParams(FrameSize size, ParamChanges changes) {
    ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
    SetTiles(params, size, std::min({8, size.width / 2, size.height / 2}), 4);
    ParamValue(params, "s_downSampleFlag") = 0;
    ParamValue(params, "s_logShowFlag") = 0;
    for (const auto& [name, value] : changes)
        ParamValue(params, name) = value;
    SetStepParams(params);
}

FrameSize SizeOf(const ParamBlock& params) {
    const host::Geometry geometry = host::GeometryOf(params);
    return {geometry.Width(), geometry.Height()};
}

PairBytes RandomPair(SimRandom& random, FrameSize size) {
    PairBytes pair;
    pair.prevGreys = RandomGreys(random, size);
    pair.currGreys = NextGreys(random, pair.prevGreys, size);
    pair.prevTypes = RandomTypes(random, size);
    pair.currTypes = random.Chance(40) ? pair.prevTypes : RandomTypes(random, size);
    return pair;
}

void LoadPair(const PairBytes& pair) {
    LoadFrame(&fpnavi::s_imagePrev, &reference::s_imagePrev, pair.prevGreys, pair.prevTypes);
    LoadFrame(&fpnavi::s_imageCurr, &reference::s_imageCurr, pair.currGreys, pair.currTypes);
    MeasurePair();
}

bool LoadMatchPair(const ParamBlock& params, const PairBytes& pair) {
    SetStepParams(params);
    LoadPair(pair);
    if (ParamValue(params, "s_multiBloclkFlag") != 1)
        return true;
    const bool built = fpnavi::GetFullImg(&fpnavi::s_imagePrev, &fpnavi::s_fullImagePrev) == 0 &&
                       fpnavi::GetFullImg(&fpnavi::s_imageCurr, &fpnavi::s_fullImageCurr) == 0;
    const bool builtPlain =
        reference::GetFullImg(&reference::s_imagePrev, &reference::s_fullImagePrev) == 0 &&
        reference::GetFullImg(&reference::s_imageCurr, &reference::s_fullImageCurr) == 0;
    EXPECT_EQ(built, builtPlain);
    return built;
}

void LoadPreProcessed(const PairBytes& pair) {
    LoadFrame(&fpnavi::s_imagePrev, &reference::s_imagePrev, pair.prevGreys, pair.prevTypes);
    LoadFrame(&fpnavi::s_imageCurr, &reference::s_imageCurr, pair.currGreys, pair.currTypes);
    for (::NaviFrame_t* const frame : {&fpnavi::s_imagePrev, &fpnavi::s_imageCurr})
        ASSERT_EQ(fpnavi::ImgPreProcess(frame), 0);
    for (reference::NaviFrame_t* const frame : {&reference::s_imagePrev, &reference::s_imageCurr})
        ASSERT_EQ(reference::ImgPreProcess(frame), 0);
    MeasurePair();
}

::testing::AssertionResult SameState() {
    const std::pair<const ::NaviFrame_t*, const reference::NaviFrame_t*> frames[] = {
        {&fpnavi::s_imagePrev, &reference::s_imagePrev},
        {&fpnavi::s_imageCurr, &reference::s_imageCurr},
        {&fpnavi::s_fullImagePrev, &reference::s_fullImagePrev},
        {&fpnavi::s_fullImageCurr, &reference::s_fullImageCurr}};
    for (const auto& [module, plain] : frames) {
        const ::testing::AssertionResult same = SameFrame(*module, *plain);
        if (!same)
            return same;
    }
    static_assert(sizeof(::NaviVoteInfo_t) == sizeof(reference::NaviVoteInfo_t));
    if (std::memcmp(::PrintNaviLog(), reference::PrintNaviLog(), sizeof(::NaviVoteInfo_t)) != 0)
        return ::testing::AssertionFailure() << "the records differ";
    return ::testing::AssertionSuccess();
}

namespace {

// The plain model's outcome in the module's numbers.
int32_t ModuleOutcome(int32_t plain) {
    switch (plain) {
        case reference::kFingerNoMove:
            return fpnavi::kNoMoveResting;
        case reference::kFingerMoved:
            return fpnavi::kNoMoveMoved;
        case reference::kFingerUndetermined:
            return fpnavi::kNoMoveUndetermined;
        default:
            return fpnavi::kNoMoveFailed;
    }
}

}  // namespace

int32_t NoMove(TwinFrame* prev, TwinFrame* curr) {
    const int32_t module = fpnavi::FingerNoMove(prev->Module(), curr->Module());
    EXPECT_EQ(module, ModuleOutcome(reference::FingerNoMove(prev->Plain(), curr->Plain())));
    EXPECT_TRUE(prev->Same());
    EXPECT_TRUE(curr->Same());
    return module;
}

int32_t NoMoveOfPair() {
    const int32_t module = fpnavi::FingerNoMove(&fpnavi::s_imagePrev, &fpnavi::s_imageCurr);
    EXPECT_EQ(module, ModuleOutcome(reference::FingerNoMove(&reference::s_imagePrev,
                                                            &reference::s_imageCurr)));
    return module;
}

namespace {

template <typename Find>
Candidates FindWith(Find find) {
    const size_t num = static_cast<size_t>(fpnavi::s_candidateNum);
    Candidates candidates = {0, std::vector<int32_t>(num, -999), std::vector<int32_t>(num, -999)};
    candidates.result = find(candidates.di.data(), candidates.dj.data());
    return candidates;
}

int32_t* MallocCopy(const std::vector<int32_t>& values) {
    const size_t bytes = values.size() * sizeof(int32_t);
    auto* const copy = static_cast<int32_t*>(std::malloc(bytes));
    std::memcpy(copy, values.data(), bytes);
    return copy;
}

}  // namespace

Candidates ModuleCandidates() {
    return FindWith(fpnavi::FindCandidate);
}

Candidates PlainCandidates() {
    return FindWith(reference::FindCandidate);
}

int32_t CompareCandidates() {
    const Candidates module = ModuleCandidates();
    const Candidates plain = PlainCandidates();
    EXPECT_EQ(module.result, plain.result);
    EXPECT_EQ(module.di, plain.di);
    EXPECT_EQ(module.dj, plain.dj);
    EXPECT_TRUE(SameState());
    return module.result;
}

namespace {

// The placements of the current pair, scored.
struct ScoredPair {
    const fpnavi::SearchParams params = fpnavi::CurrentSearchParams();
    const fpnavi::FramePair pair = fpnavi::LayOutPair(fpnavi::s_imagePrev, fpnavi::s_imageCurr);
    fpnavi::TemplateSet set;
    std::vector<uint8_t> block;
    fpnavi::SearchMemory memory;
    fpnavi::PlacementTables tables;

    ScoredPair() {
        EXPECT_TRUE(fpnavi::CutTemplates(params, pair, &set));
        block.resize(fpnavi::PlanMemory(params, set, nullptr).bytes);
        memory = fpnavi::PlanMemory(params, set, block.data());
        tables = fpnavi::ScorePlacements(params, set, pair, memory);
    }
};

}  // namespace

std::vector<uint32_t> ModuleKeys() {
    const ScoredPair scored;
    fpnavi::RankCandidates(scored.tables, scored.memory.keys, scored.params.candidateNum);
    return {scored.memory.keys, scored.memory.keys + scored.params.candidateNum};
}

Candidates SelectedCandidates() {
    const ScoredPair scored;
    return FindWith([&scored](int32_t* di, int32_t* dj) {
        fpnavi::SelectCandidates(scored.set, scored.tables, {di, dj, scored.params.candidateNum});
        return 0;
    });
}

int32_t PlacementCount() {
    return ScoredPair().tables.placements;
}

std::ostream& operator<<(std::ostream& out, const MatchResult& match) {
    return out << "dx " << match.dx << " dy " << match.dy << " difference " << match.difference;
}

MatchResult ModuleMatch(const std::vector<int32_t>& di, const std::vector<int32_t>& dj) {
    MatchResult match = {-999, -999, -999};
    EXPECT_EQ(fpnavi::FindMatch(di.data(), dj.data(), &match.dx, &match.dy, &match.difference), 0);
    return match;
}

MatchResult PlainMatch(const std::vector<int32_t>& di, const std::vector<int32_t>& dj) {
    MatchResult match = {-999, -999, -999};
    EXPECT_EQ(reference::FindMatch(MallocCopy(di), MallocCopy(dj), &match.dx, &match.dy,
                                   &match.difference),
              0);
    return match;
}

int32_t PlainScore(int32_t di, int32_t dj) {
    const int32_t num = reference::s_candidateNum;
    reference::s_candidateNum = 1;
    const int32_t score = PlainMatch({di}, {dj}).difference;
    reference::s_candidateNum = num;
    return score;
}

int32_t ModuleScore(int32_t di, int32_t dj, int32_t most) {
    const fpnavi::FramePair pair = fpnavi::LayOutPair(fpnavi::s_imagePrev, fpnavi::s_imageCurr);
    fpnavi::MeetingSlot slot;
    fpnavi::DisplacementScore score(fpnavi::CurrentSearchParams(), pair, &slot, 1);
    return score.At({di, dj}, most);
}

FrameSize ComparedSize() {
    if (fpnavi::s_multiBloclkFlag == 1)
        return {fpnavi::s_fullImageWidth, fpnavi::s_fullImageHeight};
    return {fpnavi::s_imageWidth, fpnavi::s_imageHeight};
}

JointOutcome CalcJoint() {
    return {fpnavi::CalcImgJoint(), reference::CalcImgJoint()};
}

}  // namespace fpnavi_test
