// The simulated front end, the calibration loop over it, and fpnavi tune.
#include <gmock/gmock.h>
#include <sys/wait.h>

#include <algorithm>
#include <cstdio>
#include <nlohmann/json.hpp>
#include <numeric>

#include "HostTestSupport.h"
#include "replay/TuneRun.h"
#include "simulator/FrontEnd.h"

namespace {

using host::FrontEnd;
using host::FrontEndPlan;
using host::TuneEnd;
using host::TuneRun;
using host::TuneSetup;
using host_test::ErrorOf;
using host_test::TestDirectory;
using ::testing::HasSubstr;

using Frame = std::vector<uint8_t>;

constexpr size_t kPixels = 56 * 36;
constexpr uint32_t kRefGain20 = 0x00020700U;
constexpr uint32_t kRefGain2C = 0x00000102U;

int32_t Mean(const Frame& frame) {
    return std::accumulate(frame.begin(), frame.end(), 0) / static_cast<int32_t>(frame.size());
}

// Without noise, pattern and drift: grey 180 at DC 191, 3.74 grey per DC.
FrontEndPlan QuietPlan() {
    FrontEndPlan plan;
    plan.pattern = plan.noise16 = plan.drift16 = 0;
    return plan;
}

TEST(SimFrontEnd, ReferenceGainRises374GreysIn100Dc) {
    FrontEnd sensor(QuietPlan(), host::DefaultParams());
    EXPECT_EQ(sensor.Grab(191), Frame(kPixels, 180));
    EXPECT_EQ(sensor.Grab(201), Frame(kPixels, 217));  // 180 + 37.4
    EXPECT_EQ(sensor.Grab(171), Frame(kPixels, 105));  // 180 - 74.8, downwards
    EXPECT_EQ(sensor.Grab(0xABCDEF00U | 191), Frame(kPixels, 180));
}

TEST(SimFrontEnd, SaturatesAtBothEnds) {
    FrontEnd sensor(QuietPlan(), host::DefaultParams());
    EXPECT_EQ(sensor.Grab(255), Frame(kPixels, 255));
    EXPECT_EQ(sensor.Grab(128), Frame(kPixels, 0));
}

TEST(SimFrontEnd, Layout0ReadsADifferenceForEachColumnParity) {
    FrontEndPlan plan = QuietPlan();
    plan.layout = 0;
    FrontEnd sensor(plan, host::DefaultParams());
    EXPECT_EQ(sensor.Grab(0xFF40FF40U), Frame(kPixels, 180));
    EXPECT_EQ(sensor.Grab(0xC506BF00U), Frame(kPixels, 180)) << "191 twice, by other bytes";
    const Frame mixed = sensor.Grab(0xFF36FF40U);  // 201 in the odd columns, 191 in the even ones
    EXPECT_EQ(std::count(mixed.begin(), mixed.end(), 217), static_cast<int64_t>(kPixels / 2));
    EXPECT_EQ(std::count(mixed.begin(), mixed.end(), 180), static_cast<int64_t>(kPixels / 2));
    EXPECT_EQ(sensor.Grab(0x00FF00FFU), Frame(kPixels, 0)) << "differences below 0";
}

TEST(SimFrontEnd, GainFactorFollowsTheAmplifiersAndTheMismatch) {
    FrontEndPlan plan = QuietPlan();
    EXPECT_EQ(host::TrueGainFactor(plan), 374);
    plan.mismatch = 150;
    EXPECT_EQ(host::TrueGainFactor(plan), 561);
    plan.mismatch = 100;
    plan.gain20 = 0x00070700U;
    EXPECT_EQ(host::TrueGainFactor(plan), 1309);  // 374 * 140 / 40
    plan.gain2C = 0x00000707U;
    EXPECT_EQ(host::TrueGainFactor(plan), 13962);  // 374 * 140 * 64 / 240
    plan.gain20 = plan.gain2C = 0;
    EXPECT_EQ(host::TrueGainFactor(plan), 15);
}

TEST(SimFrontEnd, FingerDarkensAndEdgesDarkenInPart) {
    FrontEndPlan plan = QuietPlan();
    plan.touch = host::Touch::Covered;
    const int32_t covered = Mean(FrontEnd(plan, host::DefaultParams()).Grab(191));
    plan.touch = host::Touch::Partial;
    const int32_t partial = Mean(FrontEnd(plan, host::DefaultParams()).Grab(191));
    EXPECT_LT(covered, 180 - 20);
    EXPECT_GT(covered, 180 - 90);
    EXPECT_GT(partial, covered);
    EXPECT_LT(partial, 180);
}

TEST(SimFrontEnd, DriftStaysWithin10Greys) {
    FrontEndPlan plan = QuietPlan();
    plan.drift16 = 64;
    FrontEnd sensor(plan, host::DefaultParams());
    int32_t least = 255;
    int32_t most = 0;
    for (int32_t i = 0; i < 300; ++i) {
        const int32_t mean = Mean(sensor.Grab(191));
        least = std::min(least, mean);
        most = std::max(most, mean);
    }
    EXPECT_GE(least, 170);
    EXPECT_LE(most, 190);
    EXPECT_GT(most, least);
}

TEST(SimFrontEnd, EqualSeedsGiveEqualPlansAndFrames) {
    for (uint64_t seed = 0; seed < 20; ++seed) {
        const FrontEndPlan plan = host::RandomFrontEnd(seed);
        FrontEnd first(plan, host::DefaultParams());
        FrontEnd second(host::RandomFrontEnd(seed), host::DefaultParams());
        for (int32_t i = 0; i < 3; ++i)
            EXPECT_EQ(first.Grab(0xFF40FFBFU), second.Grab(0xFF40FFBFU));
    }
}

TEST(SimFrontEnd, PlansStayInTheTablesAndHoldTheirStartDc) {
    for (uint64_t seed = 0; seed < 500; ++seed) {
        const FrontEndPlan plan = host::RandomFrontEnd(seed);
        ASSERT_LT((plan.gain20 >> 16) & 0xFU, 8U);
        ASSERT_LT((plan.gain2C >> 8) & 0xFU, 8U);
        ASSERT_LT(plan.gain2C & 0xFU, 8U);
        const uint32_t start = host::StartRegister(plan);
        ASSERT_EQ(host::DcOfRegister(plan.layout, start), plan.startDc);
        if (plan.layout == 0) {
            ASSERT_EQ(host::DcOfRegister(0, start >> 16), plan.startDc);
        }
    }
}

TEST(TuneRegister, DcIsReadAsItIsWritten) {
    for (int32_t dc = 0; dc < 256; ++dc) {
        EXPECT_EQ(host::DcOfRegister(1, host::RegisterOfDc(1, dc, 0xABCDEF55U)), dc);
        EXPECT_EQ(host::DcOfRegister(0, host::RegisterOfDc(0, dc, 0xABCDEF55U)), dc);
    }
    EXPECT_EQ(host::RegisterOfDc(1, 191, 0x12345650U), 0x123456BFU);
    EXPECT_EQ(host::RegisterOfDc(0, 191, 7), 0xFF40FF40U);
    EXPECT_EQ(host::RegisterOfDc(2, 191, 7), 7U);
    EXPECT_EQ(host::DcOfRegister(0, 0x00000050U), -0x50);
    EXPECT_EQ(host::DcOfRegister(2, 7, 77), 77);
}

// A run over frames that are grey all over, one after the other.
TuneRun RunFlat(const TuneSetup& setup, const std::vector<uint8_t>& greys) {
    size_t next = 0;
    return host::RunTuning(
        setup,
        [&](uint32_t) { return next < greys.size() ? Frame(kPixels, greys[next++]) : Frame(); },
        "flat");
}

// A setup without call limit. A frame in the band comes first: no history, and a run of another
// test in this process has ended.
TuneSetup SetupFrom(uint32_t start) {
    TuneSetup setup;
    setup.gain20 = kRefGain20;
    setup.gain2C = kRefGain2C;
    host::ParamValue(setup.params, "_NAVI_TimeOut_threshold") = 0;
    setup.start = 192;
    RunFlat(setup, {180});
    setup.start = start;
    return setup;
}

TEST(TuneRun, RecordsEachCall) {
    const TuneRun run = RunFlat(SetupFrom(0x12345650), {180, 230, 90, 200});
    ASSERT_EQ(run.calls.size(), 4U);
    EXPECT_FALSE(run.calls[0].measured);
    EXPECT_EQ(run.calls[0].registerBefore, 0x12345650U);
    EXPECT_EQ(run.calls[0].registerAfter, 0x123456BFU);
    EXPECT_EQ(run.calls[0].dcBefore, 0x50);
    EXPECT_EQ(run.calls[0].dcAfter, 191);

    EXPECT_TRUE(run.calls[1].measured);
    EXPECT_EQ(run.calls[1].mean, 230U);
    EXPECT_EQ(run.calls[1].topGrey, 230);
    EXPECT_EQ(run.calls[1].gainFactor, 374U);
    EXPECT_EQ(run.calls[1].effective, 1);
    EXPECT_EQ(run.calls[1].recommended, 1);
    EXPECT_EQ(run.calls[1].recommendedTop, 1);
    EXPECT_EQ(run.calls[1].dcAfter, 178);
    EXPECT_EQ(run.calls[1].direction, 0) << "the first measured call clears it";
    EXPECT_EQ(run.calls[1].noMoreProcess, 2U);
    EXPECT_EQ(run.calls[1].result, 0);

    EXPECT_EQ(run.calls[2].direction, 1);
    EXPECT_EQ(run.calls[2].step, 24U);  // 9000 / 374
    EXPECT_EQ(run.calls[2].registerAfter, 0x12345600U + 202);
    EXPECT_FALSE(run.calls[2].saturated);

    EXPECT_EQ(run.calls[3].effective, 0);
    EXPECT_EQ(run.calls[3].result, 1);
    EXPECT_EQ(run.end, TuneEnd::InBand);
    EXPECT_EQ(run.lastRegister, 0x12345600U + 202);
}

TEST(TuneRun, TellsTheEndsApart) {
    EXPECT_EQ(RunFlat(SetupFrom(255), {100}).end, TuneEnd::AtLimit);
    EXPECT_EQ(RunFlat(SetupFrom(128), {240}).end, TuneEnd::AtLimit);
    EXPECT_EQ(RunFlat(SetupFrom(200), {230, 230}).end, TuneEnd::Unfinished);

    TuneSetup setup = SetupFrom(200);
    host::ParamValue(setup.params, "_NAVI_TimeOut_threshold") = 2;
    EXPECT_EQ(RunFlat(setup, {230, 230}).end, TuneEnd::CallLimit);

    setup = SetupFrom(200);
    host::ParamValue(setup.params, "_NAVI_range_mean_recommend.RANGE_HIGH") = 255;
    EXPECT_EQ(RunFlat(setup, {240}).end, TuneEnd::NoStep);
}

TEST(TuneRun, HgModeNeedsNone) {
    TuneSetup setup = SetupFrom(5);
    host::ParamValue(setup.params, "s_modeFlag") = 1;
    const TuneRun run = host::RunTuning(
        setup, [](uint32_t) { return Frame(40 * 48, 9); }, "hg");
    EXPECT_EQ(run.end, TuneEnd::NotNeeded);
    EXPECT_EQ(run.lastRegister, 5U);
    EXPECT_EQ(run.calls.size(), 1U);
}

TEST(TuneRun, StopsAtTheBound) {
    TuneSetup setup = SetupFrom(200);
    setup.maxCalls = 3;
    const TuneRun run = RunFlat(setup, {230, 230, 230, 230});
    EXPECT_EQ(run.calls.size(), 3U);
    EXPECT_EQ(run.end, TuneEnd::Unfinished);
}

TEST(TuneRun, FramesAreTakenInSensorOrder) {
    // The first block of the raw data, 8 x 4 pixels by default, lies in the top left corner: with
    // it black the darkest corner's mean is (126 - pixels) * 230 / 126.
    TuneSetup setup = SetupFrom(200);
    const host::Geometry geometry = host::GeometryOf(setup.params);
    const auto block = static_cast<size_t>(geometry.blockWidth * geometry.blockHeight);
    ASSERT_LE(geometry.blockWidth, 14);
    ASSERT_LE(geometry.blockHeight, 9);
    Frame raw(kPixels, 230);
    std::fill(raw.begin(), raw.begin() + static_cast<std::ptrdiff_t>(block), uint8_t{0});
    setup.maxCalls = 1;
    const TuneRun run = host::RunTuning(
        setup, [&raw](uint32_t) { return raw; }, "blocks");
    EXPECT_EQ(run.calls[0].mean, (126 - block) * 230 / 126);
}

TEST(TuneRun, RefusesFramesAndGeometriesThatDoNotFit) {
    TuneSetup setup = SetupFrom(200);
    EXPECT_THAT(ErrorOf([&] {
                    host::RunTuning(
                        setup, [](uint32_t) { return Frame(7); }, "short.bin");
                }),
                HasSubstr("short.bin: frame 0: 7 bytes, expected 2016 (56 x 36)"));
    for (const int32_t width : {0, -8, 5000, 65536}) {
        host::ParamValue(setup.params, "s_blockWidthFp") = width;
        EXPECT_THAT(ErrorOf([&] { RunFlat(setup, {180}); }), HasSubstr("flat: parameters: "));
    }
}

TEST(TuneRun, EverySimulatedReferenceSensorOfBothLayoutsEndsInTheBand) {
    for (int32_t layout = 0; layout < 2; ++layout) {
        for (int32_t dc = 150; dc <= 240; dc += 10) {
            FrontEndPlan plan;
            plan.layout = layout;
            plan.centre16 = dc * 16;
            TuneSetup setup = SetupFrom(host::StartRegister(plan));
            host::ParamValue(setup.params, "iDCMode") = layout;
            FrontEnd sensor(plan, setup.params);
            const TuneRun run = host::RunTuning(
                setup, [&sensor](uint32_t dac) { return sensor.Grab(dac); }, "sensor");
            EXPECT_EQ(run.end, TuneEnd::InBand) << dc;
            EXPECT_LE(run.calls.size(), 3U);
            // 40 / 3.74 on either side, one for the noise.
            EXPECT_NEAR(host::DcOfRegister(layout, run.lastRegister), dc, 12);
        }
    }
}

// Output and exit code of the command.
struct Ran {
    std::string out;
    int code = -1;
};

Ran Command(const std::string& arguments) {
    Ran ran;
    const std::string line = std::string(FPNAVI_COMMAND) + " tune " + arguments + " 2>&1";
    FILE* pipe = popen(line.c_str(), "r");
    if (pipe == nullptr)
        return ran;
    char buffer[4096];
    for (size_t n = 0; (n = std::fread(buffer, 1, sizeof(buffer), pipe)) > 0;)
        ran.out.append(buffer, n);
    const int status = pclose(pipe);
    ran.code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    return ran;
}

TEST(TuneCommand, JsonHasALineForEachCallAndTheEnd) {
    const std::string path = TestDirectory() + "/frames.bin";
    Frame frames(kPixels, 180);
    frames.resize(2 * kPixels, 230);
    frames.resize(3 * kPixels, 200);
    host_test::WriteBytes(path, frames);
    const Ran ran = Command("--json --start 0x12345650 --raw " + path);
    ASSERT_EQ(ran.code, 1);  // the call limit
    std::vector<nlohmann::json> lines;
    for (size_t at = 0; at < ran.out.size();) {
        const size_t end = ran.out.find('\n', at);
        lines.push_back(nlohmann::json::parse(ran.out.substr(at, end - at)));
        at = end + 1;
    }
    // The reset and the step that follows are the two calls of the default limit.
    ASSERT_EQ(lines.size(), 3U);
    EXPECT_EQ(lines[0]["schema"], 1);
    EXPECT_EQ(lines[0]["kind"], "tune_call");
    EXPECT_EQ(lines[0]["measured"], false);
    EXPECT_EQ(lines[0]["register_after"], "0x123456BF");
    EXPECT_FALSE(lines[0].contains("mean"));
    EXPECT_EQ(lines[1]["mean"], 230);
    EXPECT_EQ(lines[1]["flag_effective"], 1);
    EXPECT_EQ(lines[1]["direction"], -1);
    EXPECT_EQ(lines[1]["step"], 13);
    EXPECT_EQ(lines[1]["dc_after"], 178);
    EXPECT_EQ(lines[1]["result"], 1);
    EXPECT_EQ(lines[2]["kind"], "tune");
    EXPECT_EQ(lines[2]["end"], "call limit");
    EXPECT_EQ(lines[2]["register"], "0x123456B2");
}

TEST(TuneCommand, SimulatedSensorsOfBothLayoutsArePrinted) {
    for (const char* layout : {"0", "1"}) {
        const Ran ran = Command(std::string("--seed 3 --layout ") + layout);
        EXPECT_LT(ran.code, 2);
        EXPECT_THAT(ran.out, HasSubstr("before"));
        EXPECT_THAT(ran.out, HasSubstr("after"));
        EXPECT_EQ(ran.out, Command(std::string("--seed 3 --layout ") + layout).out);
    }
}

// One frame of that grey, until it ends; the register's low byte is the DC.
Ran TuneFlat(uint8_t grey, const std::string& arguments) {
    const std::string path = TestDirectory() + "/frames.bin";
    host_test::WriteBytes(path, Frame(2 * kPixels, grey));
    return Command(arguments + " --raw " + path);
}

TEST(TuneCommand, ARunThatEndsOutsideItsBandExitsWith1) {
    const Ran inBand = TuneFlat(180, "--start 191");
    EXPECT_EQ(inBand.code, 0) << inBand.out;
    const Ran callLimit = TuneFlat(230, "--start 191");
    EXPECT_EQ(callLimit.code, 1);
    EXPECT_THAT(callLimit.out, HasSubstr("\ncall limit after 2 calls"));
    const Ran saturated = TuneFlat(255, "--start 128");
    EXPECT_EQ(saturated.code, 1);
    EXPECT_THAT(saturated.out, HasSubstr("\nat limit after 1 calls"));
    const Ran unfinished = TuneFlat(230, "--start 191 --calls 1");
    EXPECT_EQ(unfinished.code, 1);
    EXPECT_THAT(unfinished.out, HasSubstr("\nunfinished after 1 calls"));
}

TEST(TuneCommand, HgModeHasNothingToCalibrate) {
    const std::string params = TestDirectory() + "/hg.toml";
    host_test::WriteText(params, "s_modeFlag = 1\n");
    EXPECT_EQ(Command("--params " + params).code, 0);
}

TEST(TuneCommand, UsageErrorsAre2) {
    EXPECT_EQ(Command("--layout 2").code, 2);
    EXPECT_EQ(Command("--start 0x100000000").code, 2);
    EXPECT_EQ(Command("--start minus").code, 2);
    EXPECT_EQ(Command("--calls 0").code, 2);
    EXPECT_EQ(Command("--seed 1 --raw x").code, 2);
    EXPECT_EQ(Command("--nothing").code, 2);
}

TEST(TuneCommand, BadInputIs3AndNamed) {
    const std::string directory = TestDirectory();
    EXPECT_EQ(Command("--raw " + directory + "/missing.bin").code, 3);
    const std::string frames = directory + "/frames.bin";
    host_test::WriteBytes(frames, Frame(kPixels + 5, 9));
    const Ran remainder = Command("--raw " + frames);
    EXPECT_EQ(remainder.code, 3);
    EXPECT_THAT(remainder.out, HasSubstr(frames + ": byte 2016: "));
    const std::string params = directory + "/bad.toml";
    host_test::WriteText(params, "s_blockWidthFp = 0\n");
    const Ran geometry = Command("--params " + params);
    EXPECT_EQ(geometry.code, 3);
    EXPECT_THAT(geometry.out, HasSubstr(params + ":1:18: s_blockWidthFp = 0 makes"));
}

}  // namespace
