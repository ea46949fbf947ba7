// Parameters and frame pairs for the comparison of single steps: the same state on both sides, set
// up through the functions of each.
#ifndef TESTS_COMPARE_STEPTESTPAIR_H
#define TESTS_COMPARE_STEPTESTPAIR_H

#include <gtest/gtest.h>

#include <cstdint>
#include <initializer_list>
#include <string_view>
#include <utility>
#include <vector>

#include "StepFrames.h"
#include "StepSearchParams.h"
#include "matching/Templates.h"
#include "parameters/ParamTable.h"

namespace fpnavi_test {

using ParamChanges = std::initializer_list<std::pair<std::string_view, int32_t>>;

// Both sides take the defaults of the fp mode with changes; the image is one block of size.
void SetStepParams(FrameSize size, ParamChanges changes = {});
void SetStepParams(const host::ParamBlock& params);

FrameSize SizeOf(const host::ParamBlock& params);

// s_imagePrev and s_imageCurr of both sides from greys and class maps, and measured.
struct PairBytes {
    std::vector<uint8_t> prevGreys;
    std::vector<uint8_t> prevTypes;
    std::vector<uint8_t> currGreys;
    std::vector<uint8_t> currTypes;
};
PairBytes RandomPair(host::SimRandom& random, FrameSize size);
void LoadPair(const PairBytes& pair);

// The same under params, with full images where these ask for them. Returns false when the full
// images cannot be built.
bool LoadMatchPair(const host::ParamBlock& params, const PairBytes& pair);

// What the module's frames have behind their pixels when they are loaded: value, see FillRoom.
void SetRoomJunk(int32_t value);

// The frames of the gesture are loaded, pre-processed (class maps are ignored) and measured.
void LoadPreProcessed(const PairBytes& pair);

// Both sides have the same four frames and the same record.
::testing::AssertionResult SameState();

// FingerNoMove of both sides, which must agree, in the module's numbers.
int32_t NoMove(TwinFrame* prev, TwinFrame* curr);

// The same of the current pair.
int32_t NoMoveOfPair();

struct Candidates {
    int32_t result = 0;
    std::vector<int32_t> di;
    std::vector<int32_t> dj;

    bool operator==(const Candidates& other) const {
        return result == other.result && di == other.di && dj == other.dj;
    }
};
Candidates ModuleCandidates();
Candidates PlainCandidates();

// FindCandidate of both sides, which must agree: result, arrays in their order, and frames. Returns
// the result.
int32_t CompareCandidates();

// The module's candidates of the current pair as keys, in the order of its heap.
std::vector<uint32_t> ModuleKeys();

// The candidates of the current pair as the match of both steps takes them: the best first, the
// others in no order.
Candidates SelectedCandidates();

// Placements of all valid templates of the current pair.
int32_t PlacementCount();

struct MatchResult {
    int32_t dx;
    int32_t dy;
    int32_t difference;

    bool operator==(const MatchResult& other) const {
        return dx == other.dx && dy == other.dy && difference == other.difference;
    }
};
std::ostream& operator<<(std::ostream& out, const MatchResult& match);
MatchResult ModuleMatch(const std::vector<int32_t>& di, const std::vector<int32_t>& dj);
MatchResult PlainMatch(const std::vector<int32_t>& di, const std::vector<int32_t>& dj);
// What the plain model scores for this displacement alone.
int32_t PlainScore(int32_t di, int32_t dj);

// What the module scores for it, exact up to most.
int32_t ModuleScore(int32_t di, int32_t dj, int32_t most = 256);

// The sides of the frames that are compared: full images where there are any.
FrameSize ComparedSize();

// CalcImgJoint of both, and what the module left at the record's first entry.
struct JointOutcome {
    int32_t module;
    int32_t plain;
};
JointOutcome CalcJoint();

}  // namespace fpnavi_test

#endif  // TESTS_COMPARE_STEPTESTPAIR_H
