// The parts of the simulated sensor: arithmetic, skin, contact, grey levels, zones, path.
#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <algorithm>
#include <array>
#include <set>
#include <vector>

#include "parameters/ParamTable.h"
#include "simulator/Frame.h"
#include "simulator/Label.h"
#include "simulator/Path.h"
#include "simulator/Presence.h"
#include "simulator/Sensor.h"

namespace host {
namespace {

// A sensor over a finger that covers it whole, without stretch.
struct Scene {
    Skin skin{SkinShape{7, 144, 0}};
    ContactPatch patch{1800, 1800, 48, 3};
    SensorWindow window = SensorWindow::Of(ParamsForMode(Mode::Fp, true));

    std::vector<SkinPoint> At(int32_t x16, int32_t y16) {
        return SenseSkin(skin, patch, FingerState{x16, y16, 256, 0, 0}, window);
    }
};

int32_t Mean(const std::vector<uint8_t>& greys) {
    int32_t sum = 0;
    for (const uint8_t grey : greys)
        sum += grey;
    return sum / static_cast<int32_t>(greys.size());
}

TEST(SimMath, SinOfTheQuarters) {
    EXPECT_EQ(Sin(0), 0);
    EXPECT_EQ(Sin(16384), 32767);
    EXPECT_EQ(Sin(32768), 0);
    EXPECT_EQ(Sin(49152), -32767);
    EXPECT_EQ(Cos(0), 32767);
    EXPECT_EQ(Cos(65536 + 32768), -32767);
    EXPECT_NEAR(Sin(65536 / 12), 16384, 12);  // sin 30 degrees is one half
}

TEST(SimMath, Atan2OfTheEightDirections) {
    EXPECT_EQ(Atan2(0, 0), 0U);
    EXPECT_EQ(Atan2(0, 5), 0U);
    EXPECT_EQ(Atan2(5, 5), 8192U);
    EXPECT_EQ(Atan2(5, 0), 16384U);
    EXPECT_EQ(Atan2(5, -5), 24576U);
    EXPECT_EQ(Atan2(0, -5), 32768U);
    EXPECT_EQ(Atan2(-5, -5), 40960U);
    EXPECT_EQ(Atan2(-5, 0), 49152U);
    EXPECT_EQ(Atan2(-5, 5), 57344U);
}

TEST(SimMath, SquareRootIsTheFloor) {
    for (uint64_t root : {0ULL, 1ULL, 2ULL, 3ULL, 1000ULL, 65535ULL, 2147483647ULL}) {
        EXPECT_EQ(SquareRoot(root * root), root);
        EXPECT_EQ(SquareRoot(root * root + root), root);
        EXPECT_EQ(SquareRoot(root * root + 2 * root), root);
    }
}

// Where a double of 53 bits is rounded up to the next square.
TEST(SimMath, SquareRootOfLargeValuesIsTheFloor) {
    for (const uint64_t root : {94906266ULL, 134217729ULL, 2147483647ULL}) {
        EXPECT_EQ(SquareRoot(root * root), root);
        EXPECT_EQ(SquareRoot(root * root - 1), root - 1);
    }
}

TEST(SimMath, LatticeIsTheNoiseFromATable) {
    for (const uint32_t bits : {2U, 4U, 6U}) {
        const host::Lattice lattice(77, 128, bits);
        for (int32_t y = -128; y <= 128; y += 3) {
            for (int32_t x = -128; x <= 128; ++x)
                ASSERT_EQ(lattice.At(x, y), LatticeNoise(77, x, y, bits)) << x << ", " << y;
        }
    }
}

TEST(SimMath, FloorDivRoundsDown) {
    EXPECT_EQ(FloorDiv(7, 4), 1);
    EXPECT_EQ(FloorDiv(-1, 4), -1);
    EXPECT_EQ(FloorDiv(-4, 4), -1);
    EXPECT_EQ(FloorDiv(-5, 4), -2);
}

// The published first outputs of SplitMix64 for seed 0.
TEST(SimMath, GeneratorIsSplitMix64) {
    SimRandom random(0);
    EXPECT_EQ(random.Next(), 0xE220A8397B1DCDAFULL);
    EXPECT_EQ(random.Next(), 0x6E789E6AA1B965F4ULL);
    EXPECT_EQ(random.Next(), 0x06C45D188009454FULL);
}

TEST(SimMath, RangeReachesBothEndsAndNoFurther) {
    SimRandom random(1);
    std::set<int32_t> seen;
    for (int32_t i = 0; i < 200; ++i)
        seen.insert(random.Range(-2, 2));
    EXPECT_THAT(seen, testing::ElementsAre(-2, -1, 0, 1, 2));
}

TEST(SimMath, NoiseHasTheDeviationAskedFor) {
    SimRandom random(2);
    int64_t sum = 0;
    int64_t squares = 0;
    constexpr int32_t kCount = 20000;
    for (int32_t i = 0; i < kCount; ++i) {
        const int32_t value = random.Noise(160);  // 10 grey levels
        sum += value;
        squares += value * value;
    }
    EXPECT_NEAR(static_cast<int32_t>(100 * sum / kCount), 0, 30);
    EXPECT_NEAR(static_cast<int32_t>(squares / kCount), 100, 5);
}

TEST(SimMath, LatticeNoiseIsContinuous) {
    for (int32_t x = -300; x < 300; ++x)
        EXPECT_NEAR(LatticeNoise(5, x, 9, 6), LatticeNoise(5, x + 1, 9, 6), 8) << x;
}

TEST(SimSkin, EqualSeedsGiveEqualSkinInAnyOrder) {
    Skin forwards({3, 144, 0});
    Skin backwards({3, 144, 0});
    std::vector<int32_t> first;
    std::vector<int32_t> second;
    for (int32_t i = -497; i <= 497; i += 7) {
        first.push_back(forwards.HeightAt(i, 2 * i));
        second.push_back(backwards.HeightAt(-i, -2 * i));
    }
    std::reverse(second.begin(), second.end());
    EXPECT_EQ(first, second);
}

// Ridges are crossed less often where they are wider apart: 10 against 7 pixels.
TEST(SimSkin, PeriodSpacesTheRidges) {
    std::array<int32_t, 2> crossings{};
    for (size_t k = 0; k < 2; ++k) {
        Skin skin({11, k == 0 ? 112 : 160, 0});
        for (int32_t y = -100; y <= 100; y += 10) {
            for (int32_t x = -100; x < 100; ++x) {
                const bool here = skin.HeightAt(x * 16, y * 16) > 127;
                const bool next = skin.HeightAt(x * 16 + 16, y * 16) > 127;
                crossings[k] += here != next ? 1 : 0;
            }
        }
    }
    EXPECT_GT(10 * crossings[0], 12 * crossings[1]);
    EXPECT_LT(10 * crossings[0], 18 * crossings[1]);
}

TEST(SimSkin, FarPositionsShowTheRim) {
    Skin skin({3, 144, 0});
    EXPECT_EQ(skin.HeightAt(1000000, 0), skin.HeightAt(Skin::kReach * 16, 0));
    EXPECT_EQ(skin.HeightAt(0, -1000000), skin.HeightAt(0, -Skin::kReach * 16));
}

TEST(SimSkin, GradientOfEqualSkinIsTheSame) {
    Skin skin({3, 144, 0});
    SkinGradient once;
    SkinGradient twice;
    skin.AddGradient(48, 80, once);
    skin.AddGradient(48, 80, twice);
    skin.AddGradient(48, 80, twice);
    const int64_t dx = skin.HeightAt(64, 80) - skin.HeightAt(32, 80);
    EXPECT_EQ(once.xx, dx * dx);
    EXPECT_EQ(twice.yy, 2 * once.yy);
}

TEST(SensorWindow, TilesLeaveTheGapsUnread) {
    const SensorWindow window = SensorWindow::Of(ParamsForMode(Mode::Fp, false));
    EXPECT_EQ(window.width, 120);
    EXPECT_EQ(window.height, 68);
    EXPECT_EQ(window.columns[7], 7);
    EXPECT_EQ(window.columns[8], 40);
    EXPECT_EQ(window.columns[47], 79);
    EXPECT_EQ(window.columns[48], 112);
    EXPECT_EQ(window.rows[7], 7);
    EXPECT_EQ(window.rows[8], 24);
    EXPECT_EQ(window.rows[28], 60);
}

TEST(SensorWindow, PlainFramesAreContiguous) {
    const SensorWindow fp = SensorWindow::Of(ParamsForMode(Mode::Fp, true));
    EXPECT_EQ(fp.width, 56);
    EXPECT_EQ(fp.height, 36);
    EXPECT_EQ(fp.columns[48], 48);
    const SensorWindow hg = SensorWindow::Of(ParamsForMode(Mode::Hg, true));
    EXPECT_EQ(hg.width, 40);
    EXPECT_EQ(hg.height, 48);
}

TEST(PressedPatch, FullInTheMiddleNoneOutsideNoneInTheAir) {
    const ContactPatch patch{800, 600, 48, 1};
    EXPECT_EQ(PressedPatch(patch, 256).At(0, 0), 255);
    EXPECT_EQ(PressedPatch(patch, 256).At(1000, 0), 0);
    EXPECT_EQ(PressedPatch(patch, 256).At(0, -750), 0);
    EXPECT_EQ(PressedPatch(patch, 256).At(700, 0), 255);
    EXPECT_EQ(PressedPatch(patch, 64).At(700, 0), 0);  // a quarter of the pressure, half the axis
    EXPECT_EQ(PressedPatch(patch, 0).At(0, 0), 0);
}

// The finger moves 5 pixels right and 2 down; so does what the sensor feels.
TEST(SenseSkin, MovesWithTheFinger) {
    Scene scene;
    const std::vector<SkinPoint> before = scene.At(0, 0);
    const std::vector<SkinPoint> after = scene.At(5 * 16, 2 * 16);
    for (size_t row = 2; row < 36; ++row) {
        for (size_t column = 5; column < 56; ++column)
            ASSERT_EQ(after[row * 56 + column].height, before[(row - 2) * 56 + column - 5].height);
    }
}

TEST(GreyOf, AirIsBackgroundAndRidgesAreDark) {
    GreyModel model;
    EXPECT_EQ(GreyOf(model, {0, 0}), model.background);
    EXPECT_EQ(GreyOf(model, {255, 255}), model.ridge);
    EXPECT_EQ(GreyOf(model, {255, 0}), model.valley);
}

TEST(GreyModel, LevelsSuitTheMode) {
    for (uint64_t seed = 0; seed < 200; ++seed) {
        SimPlan plan = PlanOfKind(seed, Mode::Fp, false, SimKind::Rest);
        plan.skin = SkinState::Normal;
        const GreyModel fp = GreyModelOf(plan);
        EXPECT_THAT(GreyOf(fp, {255, 255}), testing::AllOf(testing::Ge(25), testing::Le(95)));
        EXPECT_THAT(GreyOf(fp, {255, 0}), testing::AllOf(testing::Ge(150), testing::Le(222)));
        EXPECT_THAT(fp.background, testing::AllOf(testing::Ge(230), testing::Le(255)));
        plan.mode = Mode::Hg;
        const GreyModel hg = GreyModelOf(plan);
        EXPECT_THAT(GreyOf(hg, {255, 255}), testing::AllOf(testing::Ge(5), testing::Le(55)));
        EXPECT_THAT(GreyOf(hg, {255, 0}), testing::AllOf(testing::Ge(75), testing::Le(160)));
    }
}

TEST(BlockOrder, BlocksFollowEachOther) {
    const Geometry geometry = GeometryOf(ParamsForMode(Mode::Fp, false));
    std::vector<uint8_t> picture(56 * 36);
    for (size_t i = 0; i < picture.size(); ++i)
        picture[i] = static_cast<uint8_t>(i * 7 % 251);
    const std::vector<uint8_t> raw = ToBlockOrder(picture, geometry);
    EXPECT_EQ(raw[8], picture[56]);        // second row of the first block
    EXPECT_EQ(raw[16], picture[8]);        // first byte of the second block
    EXPECT_EQ(raw[112], picture[2 * 56]);  // first block of the second row of blocks
    EXPECT_EQ(FromBlockOrder(raw, geometry), picture);
}

TEST(SenseZones, FullAndEmptyMaps) {
    const SensorWindow window = SensorWindow::Of(ParamsForMode(Mode::DoubleScan, false));
    const ContactPatch patch{3000, 3000, 48, 1};
    SimRandom random(1);
    const ZoneRegisters full = SenseZones(patch, FingerState{0, 0, 256, 0, 0}, window, random);
    EXPECT_EQ(full.reg28, 0xFFFFFFFFU);
    EXPECT_EQ(full.reg24, 0xFFFFFFFFU);
    const ZoneRegisters none = SenseZones(patch, FingerState{0, 0, 0, 0, 0}, window, random);
    EXPECT_EQ(none.reg28, 0U);
    EXPECT_EQ(none.reg24, 0U);
}

// A finger in the top left corner: the most significant bits of each byte of the upper rows.
TEST(SenseZones, TopLeftCornerIsTheTopBit) {
    const SensorWindow window = SensorWindow::Of(ParamsForMode(Mode::DoubleScan, false));
    const ContactPatch patch{320, 320, 16, 1};  // 20 pixels; a cell is 15 x 8.5
    SimRandom random(1);
    const FingerState corner{-60 * 16, -34 * 16, 256, 0, 0};
    const ZoneRegisters zones = SenseZones(patch, corner, window, random);
    EXPECT_EQ(zones.reg28 & 0x80000000U, 0x80000000U);
    EXPECT_EQ(zones.reg28 & 0x3F3F3F3FU, 0U);
    EXPECT_EQ(zones.reg24, 0U);
}

TEST(KeyOfAngle, NearestAxis) {
    EXPECT_EQ(KeyOfAngle(0), VKEY_RIGHT);
    EXPECT_EQ(KeyOfAngle(44), VKEY_RIGHT);
    EXPECT_EQ(KeyOfAngle(46), VKEY_UP);
    EXPECT_EQ(KeyOfAngle(180), VKEY_LEFT);
    EXPECT_EQ(KeyOfAngle(270), VKEY_DOWN);
    EXPECT_EQ(KeyOfAngle(350), VKEY_RIGHT);
    EXPECT_EQ(KeyOfAngle(-90), VKEY_DOWN);
}

TEST(FingerPath, MovesAtTheSpeedAndAngleOfThePlan) {
    SimPlan plan;
    plan.angle = 90;  // up: towards smaller y
    plan.speed16 = 80;
    plan.frames = 10;
    SimRandom random(4);
    const std::vector<FingerState> path = FingerPath(plan, random);
    const auto start = static_cast<size_t>(plan.lead + plan.land);
    for (size_t i = start + 1; i < start + 10; ++i) {
        EXPECT_NEAR(path[i].y16 - path[i - 1].y16, -80, 6 + 4) << i;  // 6 % and the tremor
        EXPECT_NEAR(path[i].x16, path[i - 1].x16, 4) << i;
    }
}

TEST(FingerPath, ReversalComesBack) {
    SimPlan plan = PlanOfKind(5, Mode::Fp, false, SimKind::Reversal);
    plan.angle = 0;
    plan.speed16 = 80;
    plan.frames = 12;
    SimRandom random(4);
    const std::vector<FingerState> path = FingerPath(plan, random);
    const auto start = static_cast<size_t>(plan.lead + plan.land);
    EXPECT_GT(path[start + 5].x16, path[start].x16 + 300);
    EXPECT_LT(path[start + 11].x16, path[start + 5].x16 - 300);
}

TEST(FingerPath, TimeOutEndsWithTheFingerDown) {
    SimPlan plan = PlanOfKind(5, Mode::Fp, false, SimKind::LongPress);
    plan.timeOut = true;
    SimRandom random(4);
    EXPECT_EQ(FingerPath(plan, random).back().pressure, plan.pressure);
    plan.timeOut = false;
    EXPECT_EQ(FingerPath(plan, random).back().pressure, 0);
}

TEST(SimPresence, EmptyFramesAreBrightAndFlat) {
    for (uint64_t seed = 0; seed < 100; ++seed) {
        const std::vector<uint8_t> frame = SimulateEmptyFrame(seed);
        ASSERT_EQ(frame.size(), 56U * 36U);
        EXPECT_GE(Mean(frame), 215) << seed;
        EXPECT_EQ(frame, SimulateEmptyFrame(seed));
        EXPECT_NE(frame, SimulateEmptyFrame(seed + 1000));
    }
}

TEST(SimPresence, TouchedFramesAreDarkerThanEmptyOnes) {
    for (uint64_t seed = 0; seed < 60; ++seed) {
        const std::vector<uint8_t> frame = SimulateTouchedFrame(seed, seed % 2 == 0);
        ASSERT_EQ(frame.size(), 56U * 36U);
        EXPECT_LT(Mean(frame), 225) << seed;
        EXPECT_LT(*std::min_element(frame.begin(), frame.end()), 130) << seed;
        EXPECT_EQ(frame, SimulateTouchedFrame(seed, seed % 2 == 0));
    }
}

}  // namespace
}  // namespace host
