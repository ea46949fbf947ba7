#include "Timing.h"

#include <time.h>

#include <algorithm>

namespace bench {
namespace {

// The median of many times of nothing.
template <class Reading>
double CostOf(const Reading& reading) {
    std::vector<double> values;
    for (int i = 0; i < 10001; ++i) {
        const double start = reading();
        values.push_back(reading() - start);
    }
    return Median(std::move(values));
}

double SteadyTime() {
    const auto now = std::chrono::steady_clock::now().time_since_epoch();
    return std::chrono::duration<double, std::nano>(now).count();
}

}  // namespace

double ClockCost() {
    static const double cost = CostOf(SteadyTime);
    return cost;
}

double ThreadTime() {
    timespec now = {};
    clock_gettime(CLOCK_THREAD_CPUTIME_ID, &now);
    return static_cast<double>(now.tv_sec) * 1e9 + static_cast<double>(now.tv_nsec);
}

double ThreadTimeCost() {
    static const double cost = CostOf(ThreadTime);
    return cost;
}

double Median(std::vector<double> values) {
    const auto middle = values.begin() + static_cast<std::ptrdiff_t>(values.size() / 2);
    std::nth_element(values.begin(), middle, values.end());
    return *middle;
}

std::vector<double> Times::MedianOfPairs() const {
    std::vector<double> medians;
    for (const std::vector<double>& times : m_ofPair)
        medians.push_back(Median(times));
    return medians;
}

double Times::MedianMicroseconds() const {
    return Median(MedianOfPairs()) / 1000;
}

double Times::LeastMicroseconds() const {
    double sum = 0;
    for (const std::vector<double>& times : m_ofPair)
        sum += *std::min_element(times.begin(), times.end());
    return sum / static_cast<double>(m_ofPair.size()) / 1000;
}

double Times::MedianPerUnit(const std::vector<double>& units) const {
    std::vector<double> values = MedianOfPairs();
    for (size_t i = 0; i < values.size(); ++i)
        values[i] /= units[i];
    return Median(std::move(values));
}

double TakeTurns(const std::vector<TimedCall>& calls, size_t pairs, std::vector<Times>* times) {
    double sum = 0;
    for (size_t pair = 0; pair < pairs; ++pair) {
        for (size_t turn = 0; turn < calls.size(); ++turn) {
            const size_t call = (pair + turn) % calls.size();
            const double time = calls[call](pair);
            (*times)[call].Add(pair, time);
            sum += call + 1 == calls.size() ? time : 0;
        }
    }
    return sum / static_cast<double>(pairs);
}

}  // namespace bench
