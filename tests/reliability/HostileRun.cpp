#include "HostileRun.h"

#include <gtest/gtest.h>
#include <sys/resource.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>

#include "RandomGesture.h"
#include "Twin.h"
#include "alog_host.h"
#include "frame/NaviFrame.h"
#include "gesture/Gesture.h"
#include "motion/CenterMove.h"
#include "motion/FingerNoMove.h"
#include "param/NaviParam.h"

namespace fpnavi_test {
namespace {

using host::Mode;
using host::ParamBlock;
using host::SimRandom;

constexpr int32_t kFrames = 4;
constexpr int32_t kTuneCalls = 2;
constexpr size_t kTwinBytes = size_t{1} << 20;       // what Twin holds
constexpr size_t kAloneBytes = size_t{4096} * 4096;  // the largest image the module takes
constexpr uint32_t kGain20 = 0x00020101U;
constexpr uint32_t kGain2C = 0x00030201U;
constexpr unsigned kHangSeconds = 600;  // of a process; the work of a pair is bounded far below

// The raw frames of a gesture and its registers; the same for module and model.
class Frames {
  public:
    Frames(const ParamBlock& params, uint64_t seed, size_t bytes)
        : m_random(seed),
          m_picture(seed, Side(host::GeometryOf(params), true),
                    Side(host::GeometryOf(params), false)),
          m_raw(bytes) {}

    const std::vector<uint8_t>& Next() {
        const std::vector<uint8_t> picture = m_picture.Next();
        std::copy(picture.begin(), picture.end(), m_raw.begin());
        return m_raw;
    }
    uint32_t Register() { return static_cast<uint32_t>(m_random.Next()); }

  private:
    // The image's side if it is small, else one that fits every buffer.
    static int32_t Side(const host::Geometry& geometry, bool width) {
        const int64_t size = width ? geometry.blockWidth : geometry.blockHeight;
        const int64_t number = width ? geometry.blockColNum : geometry.blockRowNum;
        const bool small =
            size > 0 && number > 0 && size <= 256 && number <= 256 && size * number <= 256;
        return small ? static_cast<int32_t>(size * number) : 64;
    }

    SimRandom m_random;
    MovingPicture m_picture;
    std::vector<uint8_t> m_raw;
};

// Which methods judged the pair just counted, as the driver asks them.
void NotePair(Reached* reached) {
    using namespace fpnavi;
    reached->centroid = true;
    if (IsHg())
        return;
    const int32_t verdict = FingerNoMove(&s_imagePrev, &s_imageCurr);
    reached->noMove = reached->noMove || verdict != kNoMoveUndetermined;
    reached->match =
        reached->match || (verdict == kNoMoveMoved && s_imagePrev.cvr >= s_coverageMinFp &&
                           s_imageCurr.cvr >= s_coverageMinFp);
}

// The finger status comes last: an absent finger ends the gesture.
Reached RunTwin(const ParamBlock& params, Mode mode, uint64_t seed) {
    Twin& twin = Twin::Get();
    Frames frames(params, seed, kTwinBytes);
    Reached reached;
    twin.Clear();
    int32_t pairs = 0;
    for (int32_t frame = 0; frame < kFrames; ++frame) {
        if (mode == Mode::DoubleScan) {
            const uint32_t reg24 = frames.Register();  // drawn in this order with every compiler
            twin.Zones(reg24, frames.Register());
        }
        twin.Block(frames.Next(), fpnavi::s_imageWidth);
        twin.Frame(0);
        if (fpnavi::s_voteInfo.calc_cnt > pairs)
            NotePair(&reached);
        pairs = fpnavi::s_voteInfo.calc_cnt;
    }
    reached.key = pairs > 0 && twin.Vote(1) > VKEY_NONE;
    twin.Status();
    twin.Vote(0);
    for (int32_t call = 0; call < kTuneCalls; ++call)
        twin.Tune(frames.Next(), kGain20, kGain2C);
    return reached;
}

int Silence(void* /*context*/, int /*level*/, const char* /*tag*/, const char* /*format*/,
            std::va_list /*args*/) {
    return 0;
}

// The same calls of the module alone; ends the process.
[[noreturn]] void RunAloneAndExit(const ParamBlock& params, Mode mode, uint64_t seed) {
    alarm(kHangSeconds);
    alog::SetSink(Silence, nullptr);
    Frames frames(params, seed, kAloneBytes);
    std::vector<uint8_t> image(kAloneBytes);
    ::SetNaviParam(params.data());
    ::FpNaviClear();
    for (int32_t frame = 0; frame < kFrames; ++frame) {
        if (mode == Mode::DoubleScan) {
            const uint32_t reg24 = frames.Register();
            ::GetDoubleScanNaviBlock(reg24, frames.Register());
        }
        ::GetNaviBlock(frames.Next().data(), fpnavi::s_imageWidth, 0, image.data());
        ::OrientationCalc(image.data(), image.data(), 0);
    }
    ::Voting(1);
    ::vmk_fp_navigation_detect_finger_status(image.data());
    ::Voting(0);
    uint32_t dac = 0;
    for (int32_t call = 0; call < kTuneCalls; ++call)
        ::_NAVI_Tune(image.data(), 0, 0, &dac, &kGain20, &kGain2C);
    ::FpNaviClear();
    _exit(0);
}

bool RunsAlone(const ParamBlock& params, Mode mode, uint64_t seed, int64_t* milliseconds) {
    const pid_t child = fork();
    if (child == 0)
        RunAloneAndExit(params, mode, seed);
    int status = 1;
    rusage used{};
    const bool ended = wait4(child, &status, 0, &used) == child;
    *milliseconds = used.ru_utime.tv_sec * 1000 + used.ru_utime.tv_usec / 1000;
    return ended && WIFEXITED(status) && WEXITSTATUS(status) == 0;
}

}  // namespace

bool RunHostile(const ParamBlock& params, Mode mode, uint64_t seed, Reached* reached) {
    Twin& twin = Twin::Get();
    twin.SetParam(&params);
    if (CheapEnough(params) && Twin::ImageFits()) {
        *reached = RunTwin(params, mode, seed);
        EXPECT_EQ(twin.Difference().value_or("none"), "none");
        return !twin.Difference().has_value();
    }
    reached->alone = true;
    const bool ran = RunsAlone(params, mode, seed, &reached->aloneMs);
    EXPECT_TRUE(ran) << "the module alone crashed, or never came back";
    return ran;
}

}  // namespace fpnavi_test
