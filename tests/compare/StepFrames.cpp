#include "StepFrames.h"

#include <algorithm>
#include <cstdlib>
#include <cstring>
#include <iterator>
#include <limits>

#include "frame/NaviFrame.h"

namespace fpnavi_test {
namespace {

using host::SimRandom;

int64_t FromEnvironment(const char* name, int64_t otherwise) {
    const char* const text = std::getenv(name);
    return text != nullptr ? std::atoll(text) : otherwise;
}

uint8_t Byte(int32_t value) {
    return static_cast<uint8_t>(std::clamp(value, 0, 255));
}

template <typename At>
std::vector<uint8_t> Draw(FrameSize size, At at) {
    std::vector<uint8_t> bytes(size.Pixels());
    size_t p = 0;
    for (int32_t row = 0; row < size.height; ++row) {
        for (int32_t column = 0; column < size.width; ++column)
            bytes[p++] = at(column, row);
    }
    return bytes;
}

// An ellipse or a rectangle, often cut by the frame.
class Outline {
  public:
    Outline(SimRandom& random, FrameSize size)
        : m_round(random.Chance(70)),
          m_x(random.Range(0, size.width)),
          m_y(random.Range(0, size.height)),
          m_width(random.Range(1, size.width + 3)),
          m_height(random.Range(1, size.height + 3)) {}
    bool Has(int32_t column, int32_t row) const {
        const int64_t x = std::abs(column - m_x);
        const int64_t y = std::abs(row - m_y);
        if (!m_round)
            return x < m_width && y < m_height;
        return x * x * m_height * m_height + y * y * m_width * m_width <
               m_width * m_width * m_height * m_height;
    }

  private:
    bool m_round;
    int32_t m_x;
    int32_t m_y;
    int64_t m_width;
    int64_t m_height;
};

std::vector<uint8_t> Ridges(SimRandom& random, FrameSize size) {
    const Outline outline(random, size);
    const bool everywhere = random.Chance(40);
    const int32_t period = random.Range(3, 12);
    const int32_t slopeX = random.Range(0, 8);
    const int32_t slopeY = random.Range(0, 8);
    const int32_t low = random.Range(0, 120);
    const int32_t swing = random.Range(1, 135);
    const int32_t noise = random.Chance(50) ? random.Range(1, 12) : 0;
    const int32_t ground = random.Chance(50) ? 255 : random.Range(150, 254);
    return Draw(size, [&](int32_t column, int32_t row) {
        const int32_t place = (slopeX * column + slopeY * row) / 4 % period;
        const int32_t wave = std::abs(2 * place - period) * swing / period;
        const bool inside = everywhere || outline.Has(column, row);
        const int32_t grain = noise > 0 ? random.Range(-noise, noise) : 0;
        return Byte((inside ? low + wave : ground) + grain);
    });
}

// Noise of few levels, the extreme ones among them.
std::vector<uint8_t> FewLevels(SimRandom& random, FrameSize size) {
    constexpr uint8_t kLevels[] = {0, 255, 254, 1, 253, 128};
    const int32_t count = random.Range(2, static_cast<int32_t>(std::size(kLevels)));
    const int32_t first = random.Range(1, 99);
    return Draw(size, [&](int32_t, int32_t) {
        return random.Chance(first) ? kLevels[0] : kLevels[random.Below(count)];
    });
}

std::vector<uint8_t> TwoLevels(SimRandom& random, FrameSize size) {
    const uint8_t low = Byte(random.Range(0, 254));
    const uint8_t high = Byte(random.Range(low + 1, 255));
    const int32_t share = random.Range(1, 99);
    return Draw(size, [&](int32_t, int32_t) { return random.Chance(share) ? low : high; });
}

std::vector<uint8_t> OnePixel(SimRandom& random, FrameSize size) {
    std::vector<uint8_t> greys = FlatBytes(size, random.Chance(50) ? 255 : Byte(random.Below(256)));
    greys[static_cast<size_t>(random.Below(static_cast<int32_t>(greys.size())))] =
        Byte(random.Below(256));
    return greys;
}

std::vector<uint8_t> Gradient(SimRandom& random, FrameSize size) {
    const int32_t x = random.Range(-3, 3);
    const int32_t y = random.Range(-3, 3);
    const int32_t base = random.Below(256);
    const bool wraps = random.Chance(50);
    return Draw(size, [=](int32_t column, int32_t row) {
        const int32_t grey = base + x * column + y * row;
        return wraps ? static_cast<uint8_t>(static_cast<uint32_t>(grey) & 255U) : Byte(grey);
    });
}

std::vector<uint8_t> Noise(SimRandom& random, FrameSize size, int32_t low, int32_t high) {
    return Draw(size, [&](int32_t, int32_t) { return Byte(random.Range(low, high)); });
}

}  // namespace

int64_t StepCases(int64_t count) {
    constexpr int64_t kDefault = 10000;
    return std::max<int64_t>(
        count * FromEnvironment("FPNAVI_COMPARE_GESTURES", kDefault) / kDefault, 200);
}

SimRandom StepRandom(uint64_t test, int64_t index) {
    const auto seed = static_cast<uint64_t>(FromEnvironment("FPNAVI_COMPARE_SEED", 1));
    const uint64_t start = host::Mix64(seed * 1000003 + test) + static_cast<uint64_t>(index);
    return SimRandom(host::Mix64(start));
}

int32_t RandomThreshold(SimRandom& random, int32_t low, int32_t high) {
    constexpr int32_t kBoundaries[] = {
        std::numeric_limits<int32_t>::min(), -1, 0, 1, 254, 255, 256, 257,
        std::numeric_limits<int32_t>::max()};
    if (random.Chance(85))
        return random.Range(low, high);
    return kBoundaries[random.Below(static_cast<int32_t>(std::size(kBoundaries)))];
}

std::vector<uint8_t> FlatBytes(FrameSize size, uint8_t value) {
    return std::vector<uint8_t>(size.Pixels(), value);
}

std::vector<uint8_t> RandomGreys(SimRandom& random, FrameSize size) {
    switch (random.Below(14)) {
        case 0:
            return FlatBytes(size, Byte(random.Below(256)));
        case 1:
            return FlatBytes(size, random.Chance(50) ? 0 : 255);
        case 2:
            return Noise(random, size, 0, 255);
        case 3: {
            const int32_t low = random.Below(256);
            return Noise(random, size, low, std::min(low + random.Below(6), 255));
        }
        case 4:
            return FewLevels(random, size);
        case 5:
            return TwoLevels(random, size);
        case 6:
            return OnePixel(random, size);
        case 7:
            return Gradient(random, size);
        case 8:
            return RepeatPattern(RandomPattern(random), size, 0, 0);
        default:
            return Ridges(random, size);
    }
}

Pattern RandomPattern(SimRandom& random) {
    Pattern pattern = {random.Range(2, 9), random.Range(1, 9), {}};
    const FrameSize size = {pattern.columns, pattern.rows};
    const int32_t low = random.Below(200);
    pattern.greys = Noise(random, size, low, low + random.Range(1, 55));
    return pattern;
}

std::vector<uint8_t> RepeatPattern(const Pattern& pattern, FrameSize size, int32_t column,
                                   int32_t row) {
    return Draw(size, [&](int32_t c, int32_t r) {
        const int32_t at =
            (row + r) % pattern.rows * pattern.columns + (column + c) % pattern.columns;
        return pattern.greys[static_cast<size_t>(at)];
    });
}

std::vector<uint8_t> NextGreys(SimRandom& random, const std::vector<uint8_t>& greys,
                               FrameSize size) {
    if (random.Chance(15))
        return RandomGreys(random, size);
    const int32_t dx = random.Chance(30) ? 0 : random.Range(-6, 6);
    const int32_t dy = random.Chance(30) ? 0 : random.Range(-6, 6);
    const int32_t brighter = random.Chance(60) ? 0 : random.Range(-8, 8);
    const int32_t noise = random.Chance(50) ? 0 : random.Range(1, 10);
    return Draw(size, [&](int32_t column, int32_t row) {
        const int32_t from = std::clamp(row + dy, 0, size.height - 1) * size.width +
                             std::clamp(column + dx, 0, size.width - 1);
        const int32_t grain = noise > 0 ? random.Range(-noise, noise) : 0;
        return Byte(greys[static_cast<size_t>(from)] + brighter + grain);
    });
}

std::vector<uint8_t> RandomTypes(SimRandom& random, FrameSize size) {
    constexpr uint8_t kOther[] = {0, 2, 255};
    const uint8_t other = kOther[random.Below(3)];
    const Outline outline(random, size);
    const int32_t share = random.Range(1, 99);
    switch (random.Below(10)) {
        case 0:
        case 1:
            return FlatBytes(size, 1);
        case 2:
            return FlatBytes(size, other);
        case 3: {
            std::vector<uint8_t> types = FlatBytes(size, other);
            types[static_cast<size_t>(random.Below(static_cast<int32_t>(types.size())))] = 1;
            return types;
        }
        case 4:
            return Draw(
                size, [&](int32_t, int32_t) { return random.Chance(share) ? uint8_t{1} : other; });
        case 5:
            return Draw(size, [&](int32_t, int32_t) {
                return random.Chance(share) ? uint8_t{1} : kOther[random.Below(3)];
            });
        case 6:
            return Noise(random, size, 0, 255);
        default:
            return Draw(size, [&](int32_t column, int32_t row) {
                return outline.Has(column, row) ? uint8_t{1} : other;
            });
    }
}

void FillRoom(::NaviFrame_t* img, int32_t value) {
    const int32_t bytes = fpnavi::FrameBytes(img->width, img->height);
    SimRandom random(static_cast<uint64_t>(bytes));
    for (int32_t p = img->width * img->height; p < bytes; ++p) {
        const uint64_t junk = value < 0 ? random.Next() : static_cast<uint64_t>(value) * 257;
        img->pData[p] = static_cast<uint8_t>(junk & 255U);
        img->pType[p] = static_cast<uint8_t>(junk >> 8 & 255U);
    }
}

TwinFrame::TwinFrame(FrameSize size, const std::vector<uint8_t>& greys,
                     const std::vector<uint8_t>& types)
    : m_greys(greys), m_types(types), m_greysPlain(greys), m_typesPlain(types) {
    const size_t bytes = static_cast<size_t>(fpnavi::FrameBytes(size.width, size.height));
    m_greys.resize(bytes);
    m_types.resize(bytes);
    m_module = {size.width, size.height, m_greys.data(), m_types.data(), -7, 9, -11, -13};
    m_plain = {size.width, size.height, m_greysPlain.data(), m_typesPlain.data(), -7, 9, -11, -13};
    FillRoom(&m_module, greys.front() % 2 == 0 ? 1 : kRandomJunk);  // class 1 would be finger
}

::testing::AssertionResult TwinFrame::Same() const {
    return SameFrame(m_module, m_plain);
}

::testing::AssertionResult SameFrame(const ::NaviFrame_t& module,
                                     const reference::NaviFrame_t& plain) {
    if (module.width != plain.width || module.height != plain.height)
        return ::testing::AssertionFailure() << "sizes " << module.width << " x " << module.height
                                             << " and " << plain.width << " x " << plain.height;
    if (module.cvr != plain.cvr || module.range != plain.range || module.xc != plain.xc ||
        module.yc != plain.yc)
        return ::testing::AssertionFailure()
               << "measures cvr " << module.cvr << ", " << plain.cvr << "; range "
               << int32_t{module.range} << ", " << int32_t{plain.range} << "; xc " << module.xc
               << ", " << plain.xc << "; yc " << module.yc << ", " << plain.yc;
    if ((module.pData == nullptr) != (plain.pData == nullptr) ||
        (module.pType == nullptr) != (plain.pType == nullptr))
        return ::testing::AssertionFailure() << "one of the frames has no buffers";
    if (module.pData == nullptr)
        return ::testing::AssertionSuccess();
    const size_t size = FrameSize{module.width, module.height}.Pixels();
    if (std::memcmp(module.pData, plain.pData, size) != 0)
        return ::testing::AssertionFailure() << "greys";
    if (std::memcmp(module.pType, plain.pType, size) != 0)
        return ::testing::AssertionFailure() << "class maps";
    return ::testing::AssertionSuccess();
}

}  // namespace fpnavi_test
