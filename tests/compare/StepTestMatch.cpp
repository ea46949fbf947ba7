// The full image, the match of given displacements and the score of each against the plain model,
// which reads the full images, where the module lets tiles meet.
#include <gtest/gtest.h>

#include <algorithm>
#include <limits>
#include <vector>

#include "StepFrames.h"
#include "StepTestPair.h"
#include "frame/FramePair.h"
#include "frame/NaviFrame.h"
#include "matching/DisplacementScore.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::ParamValue;
using host::SimRandom;

// Both sides' image of the full size, released at the end.
struct FullPair {
    ::NaviFrame_t module = {};
    reference::NaviFrame_t plain = {};

    FullPair() = default;
    FullPair(const FullPair&) = delete;
    FullPair& operator=(const FullPair&) = delete;
    ~FullPair() {
        fpnavi::ImgClear(&module);
        reference::ImgClear(&plain);
    }
};

TEST(StepGetFullImg, RandomTilesGiveTheSameBuffers) {
    const int64_t cases = StepCases(20000);
    FullPair full;
    int64_t built = 0;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(401, i);
        const FrameSize size = RandomSize(random);
        const int32_t boundWidth = random.Range(0, size.width / 2);
        const int32_t boundHeight = random.Range(0, size.height / 2);
        const int32_t wrong = random.Chance(8) ? random.Range(-2, 2) : 0;
        SetStepParams(size, {{"s_boundWidth", boundWidth},
                             {"s_boundHeight", boundHeight},
                             {"s_centerWidth", size.width - 2 * boundWidth + wrong},
                             {"s_centerHeight", size.height - 2 * boundHeight},
                             {"s_gapWidth", random.Range(random.Chance(5) ? -1 : 0, 20)},
                             {"s_gapHeight", random.Range(0, random.Chance(5) ? 200 : 20)}});
        TwinFrame source{size, RandomGreys(random, size), RandomTypes(random, size)};
        const int32_t result = fpnavi::GetFullImg(source.Module(), &full.module);
        ASSERT_EQ(result, reference::GetFullImg(source.Plain(), &full.plain)) << "case " << i;
        built += result == 0 ? 1 : 0;
        ASSERT_TRUE(source.Same()) << "case " << i;
        ASSERT_TRUE(SameFrame(full.module, full.plain)) << "case " << i;
    }
    EXPECT_GT(built, cases / 2);
}

int32_t RandomDisplacement(SimRandom& random, int32_t side) {
    if (random.Chance(2))
        return random.Chance(50) ? std::numeric_limits<int32_t>::min()
                                 : std::numeric_limits<int32_t>::max();
    if (random.Chance(50))
        return random.Range(-6, 6);
    return random.Range(-side - 2, side + 2);
}

TEST(StepFindMatch, RandomDisplacementsGiveTheSameBest) {
    const int64_t cases = StepCases(4000);
    SearchClasses classes;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(411, i);
        const host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
        if (!LoadMatchPair(params, RandomPair(random, SizeOf(params))))
            continue;
        classes.Note(params);
        const FrameSize compared = ComparedSize();
        const size_t num = static_cast<size_t>(fpnavi::s_candidateNum);
        std::vector<int32_t> di(num);
        std::vector<int32_t> dj(num);
        for (size_t n = 0; n < num; ++n) {
            di[n] = RandomDisplacement(random, compared.height);
            dj[n] = RandomDisplacement(random, compared.width);
        }
        ASSERT_EQ(ModuleMatch(di, dj), PlainMatch(di, dj)) << "case " << i;
        ASSERT_TRUE(SameState()) << "case " << i;
    }
    classes.ExpectAll();
}

// The score of a displacement tile by tile: exact up to most, only "above" beyond it.
void CompareScore(int32_t di, int32_t dj, int32_t score) {
    for (const int32_t most : {0, score - 1, score, score + 1, 254, 255, 256}) {
        if (most < 0 || most > 256)
            continue;
        const int32_t module = ModuleScore(di, dj, most);
        if (score <= most) {
            ASSERT_EQ(module, score) << "at most " << most;
        } else {
            ASSERT_GT(module, most) << "score " << score;
        }
    }
}

TEST(StepDisplacementScore, RandomDisplacementsOfTilesGiveTheSameScore) {
    const int64_t cases = StepCases(12000);
    int64_t scores = 0;
    SearchClasses classes;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(421, i);
        const host::ParamBlock params = RandomSearchParams(random, RandomSize(random));
        if (!LoadMatchPair(params, RandomPair(random, SizeOf(params))))
            continue;
        classes.Note(params);
        const FrameSize compared = ComparedSize();
        for (int32_t n = 0; n < 8; ++n, ++scores) {
            const int32_t di = random.Chance(60) ? random.Range(-10, 10)
                                                 : random.Range(-compared.height, compared.height);
            const int32_t dj = random.Chance(60) ? random.Range(-10, 10)
                                                 : random.Range(-compared.width, compared.width);
            CompareScore(di, dj, PlainScore(di, dj));
            ASSERT_FALSE(::testing::Test::HasFailure())
                << "case " << i << ", displacement " << di << ", " << dj;
        }
    }
    classes.ExpectAll();
    RecordProperty("scores", static_cast<int>(scores));
}

// All displacements of small frames, at which every pair of tiles meets.
TEST(StepDisplacementScore, EveryDisplacementOfSmallFramesGivesTheSameScore) {
    const int64_t cases = StepCases(200) / 4;
    for (int64_t i = 0; i < cases; ++i) {
        SimRandom random = StepRandom(422, i);
        const FrameSize size = {random.Range(1, 14), random.Range(1, 14)};
        host::ParamBlock params = RandomSearchParams(random, size);
        const int32_t bound = random.Range(0, std::min(size.width, size.height) / 2);
        SetTiles(params, size, bound, random.Range(0, 6));
        if (!LoadMatchPair(params, RandomPair(random, SizeOf(params))))
            continue;
        const FrameSize compared = ComparedSize();
        for (int32_t di = -compared.height - 1; di <= compared.height + 1; ++di) {
            for (int32_t dj = -compared.width - 1; dj <= compared.width + 1; ++dj) {
                const int32_t score = PlainScore(di, dj);
                ASSERT_EQ(ModuleScore(di, dj, 256), score)
                    << "case " << i << ", displacement " << di << ", " << dj;
            }
        }
    }
}

// The match asks for more than its minimum, where the no-move test takes exactly that.
TEST(StepDisplacementScoreTrap, AreaOfExactlyTheMinimumIsTooLittle) {
    const FrameSize size = {40, 30};
    for (const int32_t multi : {0, 1}) {
        for (const int32_t beyond : {-1, 0, 1}) {
            const int32_t pixels = static_cast<int32_t>(size.Pixels());
            host::ParamBlock params = host::ParamsForMode(host::Mode::Fp, false);
            SetTiles(params, size, 8, 4);
            ParamValue(params, "s_multiBloclkFlag") = multi;
            ParamValue(params, "s_overlapAreaMinFp") = pixels + beyond;
            ParamValue(params, "s_candidateNum") = 1;
            const std::vector<uint8_t> greys = FlatBytes(size, 77);
            ASSERT_TRUE(
                LoadMatchPair(params, {greys, FlatBytes(size, 1), greys, FlatBytes(size, 1)}));
            const int32_t expected = beyond < 0 ? 0 : 255;
            EXPECT_EQ(ModuleScore(0, 0, 256), expected) << "multi " << multi;
            EXPECT_EQ(ModuleMatch({0}, {0}).difference, expected) << "multi " << multi;
            EXPECT_EQ(PlainScore(0, 0), expected) << "multi " << multi;
        }
    }
}

}  // namespace
}  // namespace fpnavi_test
