#include "StepTestPair.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <iterator>

#include "Twin.h"
#include "frame/NaviFrame.h"
#include "frame/PreProcess.h"
#include "matching/CandidateHeap.h"
#include "matching/CandidateSearch.h"
#include "matching/MatchSearch.h"
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

// Template sizes at the limits of a piece: 64 pixels, 16 columns.
constexpr int32_t kTemplateSizes[][2] = {{12, 5}, {16, 4}, {17, 3}, {8, 8},  {13, 5},
                                         {16, 1}, {17, 1}, {1, 16}, {5, 13}, {4, 16}};

struct TemplateSize {
    int32_t width;
    int32_t height;
};

TemplateSize RandomTemplate(SimRandom& random, FrameSize size, int32_t bound) {
    if (random.Chance(30)) {
        const auto& known =
            kTemplateSizes[random.Below(static_cast<int32_t>(std::size(kTemplateSizes)))];
        return {known[0], known[1]};
    }
    if (random.Chance(20))
        return {random.Range(1, 20), random.Range(1, 20)};
    const int32_t least = std::min(size.width, size.height);
    return {random.Range(1, std::clamp(least, 1, 20)), random.Range(1, std::clamp(bound, 1, 8))};
}

// Byte comparisons of the plain model's searches.
bool CheapSearch(const ParamBlock& params) {
    const auto value = [&params](const char* name) {
        return static_cast<double>(ParamValue(params, name));
    };
    const double full =
        (value("s_centerWidth") + 2 * (value("s_gapWidth") + value("s_boundWidth"))) *
        (value("s_centerHeight") + 2 * (value("s_gapHeight") + value("s_boundHeight")));
    const double search = 8 * std::max(value("s_centerWidth"), 1.0) *
                          std::max(value("s_centerHeight"), 1.0) * value("s_templateWidth") *
                          value("s_templateHeight");
    return search < 2e6 && full * value("s_candidateNum") < 1e6 && full < 4e5;
}

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
}

void MeasurePair() {
    for (::NaviFrame_t* const frame : {&fpnavi::s_imagePrev, &fpnavi::s_imageCurr})
        ASSERT_EQ(fpnavi::GetCenterAndCoverage(frame), 0);
    for (reference::NaviFrame_t* const frame : {&reference::s_imagePrev, &reference::s_imageCurr})
        ASSERT_EQ(reference::GetCenterAndCoverage(frame), 0);
}

}  // namespace

void SetStepParams(const ParamBlock& params) {
    Twin::Get().SetParam(&params);
}

void SetTiles(ParamBlock& params, FrameSize size, int32_t bound, int32_t gap) {
    ParamValue(params, "s_blockWidthFp") = size.width;
    ParamValue(params, "s_blockHeightFp") = size.height;
    ParamValue(params, "s_blockColNumFp") = 1;
    ParamValue(params, "s_blockRowNumFp") = 1;
    ParamValue(params, "s_boundWidth") = bound;
    ParamValue(params, "s_boundHeight") = bound;
    ParamValue(params, "s_centerWidth") = size.width - 2 * bound;
    ParamValue(params, "s_centerHeight") = size.height - 2 * bound;
    ParamValue(params, "s_gapWidth") = gap;
    ParamValue(params, "s_gapHeight") = gap;
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

ParamBlock RandomSearchParams(SimRandom& random, FrameSize size) {
    ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
    const auto set = [&params](const char* name, int32_t value) {
        ParamValue(params, name) = value;
    };
    const int32_t least = std::min(size.width, size.height);
    do {
        const int32_t bound =
            random.Chance(50) ? random.Range(0, least / 3) : random.Range(0, least / 2);
        SetTiles(params, size, bound, random.Chance(30) ? 0 : random.Range(0, 20));
        if (random.Chance(30)) {
            const int32_t boundHeight = random.Range(0, size.height / 2);
            set("s_boundHeight", boundHeight);
            set("s_centerHeight", size.height - 2 * boundHeight);
            set("s_gapHeight", random.Range(0, random.Chance(10) ? 90 : 20));
        }
        if (random.Chance(6))
            set("s_centerWidth", std::max(size.width - 2 * bound + random.Range(-3, 3), 0));
        const TemplateSize tplt = RandomTemplate(random, size, bound);
        set("s_templateWidth", tplt.width);
        set("s_templateHeight", tplt.height);
        set("s_multiBloclkFlag", random.Chance(60) ? 1 : 0);
        set("s_candidateNum", random.Chance(30) ? random.Range(1, 6) : random.Range(1, 200));
    } while (!CheapSearch(params));
    set("s_overlapAreaMinFp", RandomThreshold(random, -1, static_cast<int32_t>(size.Pixels())));
    if (random.Chance(60))
        set("s_overlapAreaMinFp", random.Range(-1, 40));
    set("s_diffThresholdStr", RandomThreshold(random, 0, 60));
    set("s_singleMoveThreshold", RandomThreshold(random, 0, 6));
    set("s_dimensionlessFlag", random.Chance(30) ? 1 : 0);
    set("s_sensorWidth", RandomThreshold(random, 1, 200));
    set("s_downSampleFlag", random.Chance(20) ? 1 : 0);
    set("s_logShowFlag", 0);
    return params;
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

std::vector<uint32_t> ModuleKeys() {
    const fpnavi::SearchParams params = fpnavi::CurrentSearchParams();
    const fpnavi::FramePair pair = fpnavi::LayOutPair(fpnavi::s_imagePrev, fpnavi::s_imageCurr);
    fpnavi::TemplateSet set;
    EXPECT_TRUE(fpnavi::CutTemplates(params, pair, &set));
    std::vector<uint8_t> block(fpnavi::PlanMemory(params, set, nullptr).bytes);
    const fpnavi::SearchMemory memory = fpnavi::PlanMemory(params, set, block.data());
    fpnavi::RankCandidates(fpnavi::ScorePlacements(params, set, pair, memory), memory.keys,
                           params.candidateNum);
    return {memory.keys, memory.keys + params.candidateNum};
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

JointOutcome CalcJoint() {
    return {fpnavi::CalcImgJoint(), reference::CalcImgJoint()};
}

}  // namespace fpnavi_test
