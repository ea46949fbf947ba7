// Times: a call at a time, in rounds over all pairs, medians over rounds and then over pairs.
#ifndef BENCH_TIMING_H
#define BENCH_TIMING_H

#include <chrono>
#include <functional>
#include <vector>

namespace bench {

// Nanoseconds that two readings of the clock with nothing between them are apart.
double ClockCost();

// Nanoseconds of one call of f, without the clock's own.
template <class F>
double TimeOf(const F& f) {
    const auto start = std::chrono::steady_clock::now();
    f();
    const auto end = std::chrono::steady_clock::now();
    return std::chrono::duration<double, std::nano>(end - start).count() - ClockCost();
}

// Nanoseconds that this thread has run, and how many two readings with nothing between are apart.
// Other programs do not count, but a reading takes ten times as long: for calls of microseconds.
double ThreadTime();
double ThreadTimeCost();

// Nanoseconds of the thread in one call of f, without the reading's own.
template <class F>
double ThreadTimeOf(const F& f) {
    const double start = ThreadTime();
    f();
    return ThreadTime() - start - ThreadTimeCost();
}

// The middle value; values is not empty.
double Median(std::vector<double> values);

// All times of one step: the same number of rounds for each pair. Rounds go over all pairs before
// any pair comes again, so that the branch predictor cannot learn one.
class Times {
  public:
    explicit Times(size_t pairs) : m_ofPair(pairs) {}
    void Add(size_t pair, double nanoseconds) { m_ofPair[pair].push_back(nanoseconds); }
    // Microseconds: the median over the pairs of each pair's median.
    double MedianMicroseconds() const;
    // Microseconds: the mean over the pairs of each pair's least, which other programs on the
    // machine disturb least.
    double LeastMicroseconds() const;
    // Nanoseconds: the median over the pairs of each pair's median by its number of units, of
    // which every pair has at least one.
    double MedianPerUnit(const std::vector<double>& units) const;

  private:
    std::vector<double> MedianOfPairs() const;

    std::vector<std::vector<double>> m_ofPair;
};

// Nanoseconds of a call on the pair of that number.
using TimedCall = std::function<double(size_t)>;

// One round: each call on every pair, pair by pair, the first of them a different one each time.
// times has an entry for each call. Returns the mean nanoseconds of the last call.
double TakeTurns(const std::vector<TimedCall>& calls, size_t pairs, std::vector<Times>* times);

}  // namespace bench

#endif  // BENCH_TIMING_H
