#include "HashedCalls.h"

#include <algorithm>
#include <cstdlib>

#include "parameters/ParamTable.h"

namespace fpnavi_test {
namespace {

struct Sides {
    int64_t width;
    int64_t height;
};

Sides ImageSides(const host::ParamBlock& params) {
    const host::Geometry geometry = host::GeometryOf(params);
    return {int64_t{geometry.blockWidth} * geometry.blockColNum,
            int64_t{geometry.blockHeight} * geometry.blockRowNum};
}

bool SmallEnough(const Sides& sides) {
    return std::abs(sides.width) <= HashedCalls::kImageBytes &&
           std::abs(sides.height) <= HashedCalls::kImageBytes &&
           std::abs(sides.width * sides.height) <= HashedCalls::kImageBytes;
}

}  // namespace

bool HashedCalls::Fits(const host::ParamBlock& params) {
    return SmallEnough(ImageSides(params)) &&
           SmallEnough({host::ParamValue(params, "s_imageWidthHg"),
                        host::ParamValue(params, "s_imageHeightHg")});
}

HashedCalls::HashedCalls(const Side& side)
    : m_side(side), m_raw(size_t{kImageBytes}), m_image(size_t{kImageBytes}) {
    m_side.logTo(&m_lines);
}

void HashedCalls::Take(int32_t result) {
    m_digest.Signed(result);
    m_digest.Unsigned(static_cast<uint32_t>(m_lines.size()));
    for (const std::string& line : m_lines)
        m_digest.Text(line);
    m_counts.logLines += static_cast<int64_t>(m_lines.size());
    m_lines.clear();
}

void HashedCalls::TakeRecord() {
    const int32_t* const record = m_side.record();
    for (size_t i = 0; i < kRecordIntegers; ++i)
        m_digest.Signed(record[i]);
}

void HashedCalls::SetParam(const host::ParamBlock& params) {
    Take(m_side.setParam(params.data()));
    const Sides sides = ImageSides(params);
    const bool image = sides.width > 0 && sides.height > 0;
    m_imageSize = image ? static_cast<size_t>(sides.width * sides.height) : 0;
}

void HashedCalls::Clear() {
    m_side.clear();
    Take(0);
    TakeRecord();
}

void HashedCalls::Zones(uint32_t reg24, uint32_t reg28) {
    Take(m_side.zones(reg24, reg28));
}

void HashedCalls::Block(const std::vector<uint8_t>& raw, int32_t width) {
    std::copy(raw.begin(), raw.end(), m_raw.begin());
    Take(m_side.block(m_raw.data(), width, 0, m_image.data()));
    m_digest.Bytes(m_image.data(), m_imageSize);
}

void HashedCalls::Status(bool null) {
    const int32_t result = m_side.status(null ? nullptr : m_image.data());
    m_counts.absent += result == 0 ? 1 : 0;
    m_counts.refused += result < 0 ? 1 : 0;
    Take(result);
}

void HashedCalls::Frame(int32_t timeOut, bool nullPrev, bool nullCurr) {
    const int32_t result = m_side.frame(nullPrev ? nullptr : m_image.data(),
                                        nullCurr ? nullptr : m_image.data(), timeOut);
    m_counts.refused += result < 0 ? 1 : 0;
    Take(result);
}

void HashedCalls::Vote(int32_t timeOut) {
    const int32_t result = m_side.vote(timeOut);
    m_counts.results.at(static_cast<size_t>(result + 1))++;
    Take(result);
    TakeRecord();
}

int32_t HashedCalls::Tune(uint32_t gain20, uint32_t gain2C) {
    const int32_t result = m_side.tune(m_image.data(), 0, 0, &m_dac, &gain20, &gain2C);
    m_counts.tuneCalls++;
    Take(result);
    m_digest.Unsigned(m_dac);
    return result;
}

void HashedCalls::EndGesture() {
    m_counts.gestures++;
    m_counts.pairs += m_side.record()[0];
}

}  // namespace fpnavi_test
