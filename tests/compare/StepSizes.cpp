#include "StepSizes.h"

#include <gtest/gtest.h>

#include <algorithm>
#include <iterator>

namespace fpnavi_test {
namespace {

using host::SimRandom;

constexpr int32_t kMostPixels = 20000;

int32_t RandomSide(SimRandom& random) {
    if (random.Chance(4))
        return random.Range(71, 200);
    return random.Chance(35) ? RandomEdge(random) : random.Range(1, 70);
}

}  // namespace

std::vector<FrameSize> EdgeSizes() {
    std::vector<FrameSize> sizes;
    for (const int32_t width : kEdges) {
        for (const int32_t height : kEdges)
            sizes.push_back({width, height});
    }
    return sizes;
}

int32_t RandomEdge(SimRandom& random) {
    return kEdges[random.Below(static_cast<int32_t>(std::size(kEdges)))];
}

FrameSize RandomSize(SimRandom& random) {
    FrameSize size = {RandomSide(random), RandomSide(random)};
    if (size.width * size.height > kMostPixels)
        size.height = random.Range(1, 40);
    return size;
}

int32_t RandomLength(SimRandom& random, int32_t most) {
    switch (random.Below(5)) {
        case 0:
            return std::min(RandomEdge(random), most);
        case 1:
            return random.Chance(50) ? most / 2 : most;
        default:
            return random.Range(0, most);
    }
}

CaseClasses::CaseClasses(std::string what, std::initializer_list<const char*> classes)
    : m_what(std::move(what)) {
    for (const char* const name : classes)
        m_classes.emplace_back(name, 0);
}

void CaseClasses::Note(int32_t number) {
    const int32_t last = static_cast<int32_t>(m_classes.size()) - 1;
    ++m_classes[static_cast<size_t>(std::min(number, last))].second;
}

void CaseClasses::ExpectAll() const {
    for (const auto& [name, count] : m_classes) {
        EXPECT_GT(count, 0) << m_what << " " << name;
        ::testing::Test::RecordProperty(m_what + "_" + name, count);
    }
}

}  // namespace fpnavi_test
