// The common form of every log line, by the version line of OrientationCalc.
#include <gmock/gmock.h>
#include <gtest/gtest.h>
#include <unistd.h>

#include <string>
#include <vector>

#include "Fixtures.h"
#include "LogCapture.h"
#include "alog.h"

namespace {

using namespace fpnavi_test;

class Log : public NaviTest {};

TEST_F(Log, LineHasPriorityTagAndPrefix) {
    Params().Set("s_logShowFlag", 1).Apply();
    LogCapture log;
    OrientationCalc(nullptr, nullptr, 0);
    ASSERT_EQ(log.Lines().size(), 1U);
    const LogLine& line = log.Lines()[0];
    EXPECT_EQ(line.priority, 4);
    EXPECT_EQ(line.priority, TQ_LOG_DEBUG);
    EXPECT_EQ(line.tag, "TQCODE");
    EXPECT_EQ(line.format,
              "%-15s:%04d:pid=%d:ctid=%d => "
              "TQCODE - OrientationCalc - Navi.ver.01.07.10!\n");
    EXPECT_EQ(line.function, "OrientationCalc");
    EXPECT_EQ(line.line, 328);
    EXPECT_EQ(line.pid, getpid());
    EXPECT_EQ(line.tid, gettid());
    EXPECT_EQ(line.text, "OrientationCalc:0328:pid=" + std::to_string(getpid()) +
                             ":ctid=" + std::to_string(gettid()) +
                             " => TQCODE - OrientationCalc - Navi.ver.01.07.10!\n");
}

TEST_F(Log, VersionLineComesAtEveryCallBeforeAnyCheck) {
    Params().Set("s_logShowFlag", 1).Apply();
    const std::vector<uint8_t> image(2016, 255);
    LogCapture log;
    OrientationCalc(nullptr, image.data(), 0);
    OrientationCalc(image.data(), nullptr, 0);
    OrientationCalc(image.data(), image.data(), 1);
    OrientationCalc(image.data(), image.data(), 0);
    EXPECT_EQ(log.Lines().size(), 4U);
}

TEST_F(Log, OnlyFlagOneEnablesLines) {
    const std::vector<uint8_t> image(2016, 255);
    for (const int32_t flag : {0, 2, -1}) {
        Params().Set("s_logShowFlag", flag).Apply();
        LogCapture log;
        OrientationCalc(image.data(), image.data(), 0);
        Voting(1);
        EXPECT_TRUE(log.Lines().empty()) << flag;
    }
}

TEST_F(Log, FailuresAreSilent) {
    Params().Set("s_logShowFlag", 1).Apply();
    LogCapture log;
    EXPECT_EQ(GetNaviBlock(nullptr, 0, 0, nullptr), -1);
    EXPECT_EQ(vmk_fp_navigation_detect_finger_status(nullptr), -1);
    EXPECT_EQ(SetNaviParam(nullptr), -1);
    EXPECT_EQ(Voting(0), -1);
    EXPECT_TRUE(log.Lines().empty());
}

TEST_F(Log, ClearAndStatusAndRegistersWriteNoLine) {
    Params().Set("s_logShowFlag", 1).Apply();
    const std::vector<uint8_t> image(2016, 255);
    LogCapture log;
    FpNaviClear();
    GetDoubleScanNaviBlock(1, 2);
    EXPECT_EQ(vmk_fp_navigation_detect_finger_status(image.data()), 0);
    EXPECT_TRUE(log.Lines().empty());
}

TEST_F(Log, FunctionNameIsPaddedToFifteenColumns) {
    Params().Set("s_logShowFlag", 1).Set("s_modeFlag", 1).Apply();
    LogCapture log;
    Voting(1);
    ASSERT_EQ(log.Lines().size(), 1U);
    EXPECT_THAT(log.Lines()[0].text, ::testing::StartsWith("Voting         :0498:pid="));
}

TEST(HostLog, WithoutASinkLinesGoToStderr) {
    ::testing::internal::CaptureStderr();
    const int written = tq_log_printf(TQ_LOG_DEBUG, "TAG", "%d of %s\n", 3, "four");
    EXPECT_EQ(::testing::internal::GetCapturedStderr(), "3 of four\n");
    EXPECT_EQ(written, 10);
}

}  // namespace
