#include "replay/ReplayCorpus.h"

#include <fmt/core.h>

#include <deque>
#include <memory>

#include "common/Error.h"

namespace host {
namespace {

// The heads of a store in parts, the store closed in between: no child process may share it.
class HeadList {
  public:
    HeadList(const std::string& path, int64_t count) : m_path(path), m_left(count) {}

    std::optional<GestureHead> Next() {
        if (m_part.empty())
            ReadPart();
        if (m_part.empty())
            return std::nullopt;
        GestureHead head = std::move(m_part.front());
        m_part.pop_front();
        return head;
    }

  private:
    void ReadPart() {
        const std::vector<GestureHead> heads =
            Store::OpenForReading(m_path).Heads(m_after, std::min(m_left, kPart));
        if (heads.empty() && m_left > 0)
            throw Error(m_path, "table gesture",
                        fmt::format("{} rows less than were counted: the file is damaged", m_left));
        for (const GestureHead& head : heads) {
            if (head.seq <= m_after)
                throw Error(m_path, "table gesture",
                            fmt::format("row {} comes after row {}: the file is damaged", head.seq,
                                        m_after));
            m_after = head.seq;
        }
        m_left -= static_cast<int64_t>(heads.size());
        m_part.assign(heads.begin(), heads.end());
    }

    static constexpr int64_t kPart = 4096;

    const std::string& m_path;
    int64_t m_left;
    int64_t m_after = INT64_MIN;
    std::deque<GestureHead> m_part;
};

// Whatever in the store the overrides do not go with, before anything is replayed.
StoreExtent CheckStore(const CorpusReplay& replay) {
    const Store store = Store::OpenForReading(replay.path);
    if (!replay.overrides.settings.empty())
        store.ForEachParams([&](const ParamBlock& params, const std::string& id) {
            CheckOverrides(replay.overrides, params, id);
        });
    return store.Extent();
}

}  // namespace

void ReplayCorpus(const CorpusReplay& replay, const std::function<void(const StoreExtent&)>& start,
                  const ResultSink& sink) {
    const StoreExtent extent = CheckStore(replay);
    start(extent);
    HeadList list(replay.path, extent.count);
    ReplayJob job;
    job.source = replay.path;
    job.processes = replay.processes;
    job.next = [&list] { return list.Next(); };
    job.openReader = [&replay] {
        const auto store = std::make_shared<Store>(Store::OpenForReading(replay.path));
        return GestureReader([store, &replay](int64_t seq) {
            Gesture gesture = store->ReadRow(seq);
            ApplyOverrides(replay.overrides, &gesture.params);
            return gesture;
        });
    };
    ReplayMany(job, sink);
}

}  // namespace host
