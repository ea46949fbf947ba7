// Gestures of a corpus by several threads, handed on in their order.
//
// Requirement: the output does not depend on the number of threads, and memory is bounded.
// Observation: a gesture is a function of seed and index alone.
// Algorithm: each thread takes the next index, simulates, and puts the gesture into the slot
// index % slots. It waits until the gesture that was in that slot has been handed on.
#include <condition_variable>
#include <exception>
#include <mutex>
#include <optional>
#include <thread>
#include <utility>
#include <vector>

#include "simulator/Corpus.h"

namespace host {
namespace {

constexpr int64_t kSlotsPerThread = 4;

class Line {
  public:
    Line(uint64_t seed, int64_t first, int64_t count, int64_t threads)
        : m_seed(seed),
          m_first(first),
          m_count(count),
          m_slots(static_cast<size_t>(threads * kSlotsPerThread)) {
        for (int64_t i = 0; i < threads; ++i)
            m_threads.emplace_back([this] { Work(); });
    }
    ~Line() {
        {
            const std::lock_guard<std::mutex> guard(m_mutex);
            m_ended = true;
        }
        m_changed.notify_all();
        for (std::thread& thread : m_threads)
            thread.join();
    }
    Line(const Line&) = delete;
    Line& operator=(const Line&) = delete;

    // The next gesture in order; throws what a thread threw.
    Gesture Take() {
        std::unique_lock<std::mutex> guard(m_mutex);
        std::optional<Gesture>& slot = Slot(m_given);
        m_changed.wait(guard, [&] { return slot.has_value() || m_failure; });
        if (m_failure)
            std::rethrow_exception(m_failure);
        Gesture gesture = std::move(*slot);
        slot.reset();
        ++m_given;
        guard.unlock();
        m_changed.notify_all();
        return gesture;
    }

  private:
    std::optional<Gesture>& Slot(int64_t index) {
        return m_slots[static_cast<size_t>(index) % m_slots.size()];
    }

    void Work() {
        std::unique_lock<std::mutex> guard(m_mutex);
        while (m_taken < m_count && !m_ended) {
            const int64_t index = m_taken++;
            guard.unlock();
            std::optional<Gesture> gesture;
            std::exception_ptr failure;
            try {
                gesture = SimulateCorpusGesture(m_seed, m_first + index);
            } catch (...) {
                failure = std::current_exception();
            }
            guard.lock();
            const auto slots = static_cast<int64_t>(m_slots.size());
            m_changed.wait(guard, [&] { return index < m_given + slots || m_ended; });
            if (failure)
                m_failure = failure;
            else if (!m_ended)
                Slot(index) = std::move(gesture);
            m_changed.notify_all();
        }
    }

    const uint64_t m_seed;
    const int64_t m_first;
    const int64_t m_count;
    std::mutex m_mutex;  // guards all below but the threads
    std::condition_variable m_changed;
    std::vector<std::optional<Gesture>> m_slots;
    int64_t m_taken = 0;  // gestures that a thread has begun
    int64_t m_given = 0;  // gestures handed on
    std::exception_ptr m_failure;
    bool m_ended = false;
    std::vector<std::thread> m_threads;
};

}  // namespace

void SimulateCorpus(const CorpusPart& part, int32_t threads,
                    const std::function<bool(Gesture&&)>& take) {
    const int64_t processors = std::thread::hardware_concurrency();
    const int64_t wanted = threads > 0 ? threads : processors;
    Line line(part.seed, part.first, part.count,
              wanted < 1 ? 1 : (wanted < part.count ? wanted : part.count));
    for (int64_t i = 0; i < part.count; ++i) {
        if (!take(line.Take()))
            break;
    }
}

}  // namespace host
