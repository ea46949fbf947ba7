#include "CompareRun.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <cstdlib>
#include <iterator>

#include "FpNavi.h"
#include "RandomGesture.h"
#include "Twin.h"
#include "simulator/Arithmetic.h"

namespace fpnavi_test {
namespace {

using host::ParamValue;

int64_t FromEnvironment(const char* name, int64_t otherwise) {
    const char* const text = std::getenv(name);
    return text != nullptr ? std::atoll(text) : otherwise;
}

}  // namespace

int64_t Gestures(int64_t percent) {
    return std::max<int64_t>(FromEnvironment("FPNAVI_COMPARE_GESTURES", 10000) * percent / 100, 1);
}

uint64_t SeedOf(uint64_t test, int64_t index) {
    const auto seed = static_cast<uint64_t>(FromEnvironment("FPNAVI_COMPARE_SEED", 1));
    return host::Mix64(seed * 1000003 + test) + static_cast<uint64_t>(index);
}

void GestureCounts::Note(const host::ParamBlock& params) {
    Note("gestures");
    NoteSensor(params);
    NoteRecord();
}

void GestureCounts::NoteSensor(const host::ParamBlock& params) {
    const host::Geometry geometry = host::GeometryOf(params);
    const auto isDefault = [&geometry](host::Mode mode) {
        return geometry == host::GeometryOf(host::ParamsForMode(mode, false)) ||
               geometry == host::GeometryOf(host::ParamsForMode(mode, true));
    };
    const bool hg = ParamValue(params, "s_modeFlag") == 1;
    Note(isDefault(hg ? host::Mode::Hg : host::Mode::Fp) ? "sensor_default" : "sensor_other");
    const FrameSize size = PictureSize(params);
    const int32_t words = std::min((size.width - 1) / 64 + 1, 3);
    Note("words_" + std::to_string(words) + (words == 3 ? "_or_more" : ""));
    const bool edge = std::any_of(std::begin(kEdges), std::end(kEdges), [&size](int32_t side) {
        return size.width == side || size.height == side;
    });
    if (edge)
        Note("side_at_an_edge");
    if (hg)
        return Note("hg");
    const int64_t width = ParamValue(params, "s_templateWidth");
    const int64_t height = ParamValue(params, "s_templateHeight");
    Note(std::max(width, height) <= 16 && width * height <= 64 ? "template_one_piece"
                                                               : "template_more_pieces");
    const bool gaps =
        ParamValue(params, "s_gapWidth") != 0 || ParamValue(params, "s_gapHeight") != 0;
    const bool tiled = ParamValue(params, "s_multiBloclkFlag") == 1;
    Note(!tiled ? "layout_plain" : (gaps ? "layout_gaps" : "layout_no_gaps"));
}

void GestureCounts::NoteRecord() {
    const NaviVoteInfo_t& record = *::PrintNaviLog();
    const int32_t pairs = std::clamp(record.calc_cnt, 0, 99);
    if (pairs > 0)
        Note("with_a_pair");
    const auto any = [pairs](const int32_t* entries) {
        return std::any_of(entries, entries + pairs, [](int32_t entry) { return entry != 0; });
    };
    if (any(record.diff))
        Note("with_a_match");
    if (any(record.dx_fp) || any(record.dy_fp))
        Note("with_a_matched_move");
}

void GestureCounts::Record() const {
    for (const auto& [what, count] : m_counts)
        ::testing::Test::RecordProperty(what, count);
    ::testing::Test::RecordProperty("calls", static_cast<int>(Twin::Get().Calls()));
    if (std::getenv("FPNAVI_COMPARE_COUNTS") == nullptr)
        return;
    for (const auto& [what, count] : m_counts)
        std::printf("%10d %s\n", count, what.c_str());
}

}  // namespace fpnavi_test
