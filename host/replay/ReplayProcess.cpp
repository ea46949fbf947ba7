// Requirement: results in the order of the list, each as soon as it can be given, every gesture
// read once, and no more in memory for a million gestures than for a thousand.
//
// Observation: the list says which mode a gesture has, so it need not be read to know which kind of
// process it needs.
//
// Algorithm: the parent takes gestures from the list as long as fewer than a window of them lack a
// result that has been given. Those of double scan wait in one queue, all others in another. Tasks
// of a few gestures go out of the queue with the foremost gesture first, otherwise out of the other
// one: to a process at work on its last task, so that none waits for the parent, or to an idle or
// new one as long as fewer than the limit are at work.
#include "replay/ReplayProcess.h"

#include <fmt/core.h>
#include <poll.h>
#include <sys/socket.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <deque>
#include <list>
#include <map>
#include <thread>

#include "common/Error.h"
#include "replay/ReplayWire.h"
#include "replay/ReplayWorker.h"

namespace host {
namespace {

constexpr size_t kTaskMax = 16;      // gestures; fewer towards the end, so that all end together
constexpr size_t kWindowPart = 256;  // gestures under way for each process

[[noreturn]] void Fail(const char* what, int reason) {
    throw Error("replay", "", fmt::format("{}: {}", what, std::strerror(reason)));
}

struct Item {
    size_t index = 0;  // in the list
    GestureHead head;
};

using Queue = std::map<size_t, GestureHead>;  // by index in the list

struct Worker {
    Worker(pid_t itsPid, int itsSocket, bool itsDoubleScan)
        : pid(itsPid), socket(itsSocket), doubleScan(itsDoubleScan), receiver(itsSocket) {}

    bool AtWork() const { return !items.empty(); }

    pid_t pid;
    int socket;
    bool doubleScan;
    std::deque<Item> items;  // given and not yet answered
    wire::Receiver receiver;
};

int Wait(pid_t pid) {
    int status = 0;
    while (waitpid(pid, &status, 0) < 0 && errno == EINTR) {
    }
    return status;
}

// What is known of a gesture that was not replayed; verdict wrong.
ReplayResult ResultOf(const GestureHead& head) {
    ReplayResult result;
    result.id = head.id;
    result.mode = head.mode.value_or(Mode::Fp);
    result.tier = head.tier;
    result.label = head.label;
    result.frameCount = head.frameCount;
    return result;
}

ReplayResult Crashed(const GestureHead& head, int status) {
    ReplayResult result = ResultOf(head);
    result.errors.push_back(
        WIFSIGNALED(status)
            ? fmt::format("the process replaying it ended by signal {}", WTERMSIG(status))
            : fmt::format("the process replaying it ended with status {}", WEXITSTATUS(status)));
    return result;
}

class Pool {
  public:
    Pool(const ReplayJob& job, const ResultSink& sink) : m_job(job), m_sink(sink) {
        m_limit = job.processes > 0 ? static_cast<size_t>(job.processes)
                                    : std::max<size_t>(1, std::thread::hardware_concurrency());
    }

    Pool(const Pool&) = delete;
    Pool& operator=(const Pool&) = delete;

    ~Pool() {  // they write nothing, so nothing is lost
        for (const Worker& worker : m_workers) {
            kill(worker.pid, SIGKILL);
            close(worker.socket);
            Wait(worker.pid);
        }
    }

    void Run() {
        for (;;) {
            TakeFromList();
            while (GiveTask()) {
            }
            if (AtWork() == 0)
                return;
            Receive();
        }
    }

  private:
    void TakeFromList() {
        while (!m_listEnded && m_listed - m_delivered < m_limit * kWindowPart) {
            std::optional<GestureHead> head = m_job.next();
            m_listEnded = !head;
            if (head) {
                QueueOf(head->mode == Mode::DoubleScan).emplace(m_listed, std::move(*head));
                ++m_listed;
            }
        }
    }

    size_t AtWork() const {
        return static_cast<size_t>(std::count_if(m_workers.begin(), m_workers.end(),
                                                 [](const Worker& w) { return w.AtWork(); }));
    }

    // Returns false when nothing waits, or everyone has enough to do.
    bool GiveTask() {
        const bool first =
            m_others.empty() ||
            (!m_doubleScan.empty() && m_doubleScan.begin()->first < m_others.begin()->first);
        return GiveTask(first) || GiveTask(!first);
    }

    bool GiveTask(bool doubleScan) {
        Queue& queue = QueueOf(doubleScan);
        Worker* const worker = queue.empty() ? nullptr : Taker(doubleScan);
        if (worker == nullptr)
            return false;
        std::vector<int64_t> seqs;
        for (size_t left = std::clamp<size_t>(queue.size() / (4 * m_limit), 1, kTaskMax); left > 0;
             --left) {
            seqs.push_back(queue.begin()->second.seq);
            worker->items.push_back({queue.begin()->first, std::move(queue.begin()->second)});
            queue.erase(queue.begin());
        }
        // A process that is gone shows as the end of its stream.
        wire::Send(worker->socket, wire::Kind::Task, wire::EncodeTask(seqs));
        return true;
    }

    // The process that is to take the next task of a kind; null: none now.
    Worker* Taker(bool doubleScan) {
        Worker* idle = nullptr;
        Worker* onItsLast = nullptr;
        for (Worker& worker : m_workers) {
            if (worker.doubleScan == doubleScan && !worker.AtWork())
                idle = &worker;
            else if (worker.doubleScan == doubleScan && worker.items.size() <= kTaskMax / 2)
                onItsLast = &worker;
        }
        if (AtWork() >= m_limit)
            return onItsLast;
        return idle != nullptr ? idle : &Start(doubleScan);
    }

    Queue& QueueOf(bool doubleScan) { return doubleScan ? m_doubleScan : m_others; }

    Worker& Start(bool doubleScan) {
        int ends[2];
        if (socketpair(AF_UNIX, SOCK_STREAM, 0, ends) != 0)
            Fail("cannot open a socket", errno);
        const pid_t pid = fork();
        if (pid < 0) {
            const int reason = errno;
            close(ends[0]);
            close(ends[1]);
            Fail("cannot start a process", reason);
        }
        if (pid == 0) {
            close(ends[0]);
            for (const Worker& worker : m_workers)
                close(worker.socket);  // else the others would not notice the parent's end
            RunWorker(m_job, doubleScan, ends[1]);
        }
        close(ends[1]);
        return m_workers.emplace_back(pid, ends[0], doubleScan);
    }

    // Waits for the children to say something, and listens to each that does.
    void Receive() {
        std::vector<pollfd> polls;
        for (const Worker& worker : m_workers)
            polls.push_back({worker.socket, POLLIN, 0});
        if (poll(polls.data(), polls.size(), -1) < 0) {
            if (errno == EINTR)
                return;
            Fail("cannot wait for a process", errno);
        }
        auto worker = m_workers.begin();
        for (const pollfd& entry : polls) {
            const auto current = worker++;
            if (entry.revents == 0 || Listen(&*current))
                continue;
            close(current->socket);
            const Worker ended = std::move(*current);
            m_workers.erase(current);
            Finish(ended, Wait(ended.pid));
        }
    }

    // Takes what has come. Returns false at the end of the stream.
    bool Listen(Worker* worker) {
        const bool open = worker->receiver.Fill();
        while (const std::optional<wire::Message> message = worker->receiver.Take()) {
            if (message->kind == wire::Kind::Error)
                wire::ThrowError(message->payload);
            if (!worker->AtWork())
                throw Error("replay", "", "a replaying process answered more than it was asked");
            Answered(worker->items.front(), wire::Decode(message->payload));
            worker->items.pop_front();
        }
        return open;
    }

    // The stream has ended: by a crash, if there was something to do.
    void Finish(const Worker& worker, int status) {
        if (!worker.AtWork())
            return;
        for (size_t k = 1; k < worker.items.size(); ++k)
            QueueOf(worker.doubleScan).emplace(worker.items[k].index, worker.items[k].head);
        Deliver(worker.items[0].index, Crashed(worker.items[0].head, status));
    }

    void Answered(const Item& item, ReplayResult result) {
        if (result.verdict == Verdict::Unreadable) {
            ReplayResult known = ResultOf(item.head);
            known.verdict = result.verdict;
            known.errors = std::move(result.errors);
            result = std::move(known);
        }
        Deliver(item.index, std::move(result));
    }

    // Keeps results until all before them have come.
    void Deliver(size_t index, ReplayResult result) {
        m_early.emplace(index, std::move(result));
        for (auto it = m_early.begin(); it != m_early.end() && it->first == m_delivered;) {
            m_sink(it->first, it->second);
            it = m_early.erase(it);
            ++m_delivered;
        }
    }

    const ReplayJob& m_job;
    const ResultSink& m_sink;
    size_t m_limit = 1;
    bool m_listEnded = false;
    size_t m_listed = 0;     // gestures taken from the list
    size_t m_delivered = 0;  // results given
    Queue m_doubleScan;
    Queue m_others;
    std::list<Worker> m_workers;
    std::map<size_t, ReplayResult> m_early;
};

}  // namespace

void ReplayMany(const ReplayJob& job, const ResultSink& sink) {
    Pool(job, sink).Run();
}

}  // namespace host
