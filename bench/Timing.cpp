#include "Timing.h"

#include <algorithm>

namespace bench {
namespace {

double MeasureClock() {
    std::vector<double> values;
    for (int i = 0; i < 10001; ++i) {
        const auto start = std::chrono::steady_clock::now();
        const auto end = std::chrono::steady_clock::now();
        values.push_back(std::chrono::duration<double, std::nano>(end - start).count());
    }
    return Median(std::move(values));
}

}  // namespace

double ClockCost() {
    static const double cost = MeasureClock();
    return cost;
}

double Median(std::vector<double> values) {
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    return *middle;
}

double Times::MedianMicroseconds() const {
    std::vector<double> medians;
    for (const std::vector<double>& times : m_ofPair)
        medians.push_back(Median(times));
    return Median(std::move(medians)) / 1000;
}

}  // namespace bench
