// Requirement: results in the order of the list, each as soon as it can be given, every gesture
// read once, and no more in memory for a million gestures than for a thousand.
//
// Observation: the list says which mode a gesture has, so it need not be read to know which kind of
// process it needs.
//
// Algorithm: the parent takes gestures from the list as long as fewer than a window of them lack a
// result that has been given. Those of double scan wait in one queue, all others in another. A
// process at work holds a small task; as soon as fewer than the limit are at work, the queue with
// the foremost gesture gives the next task to an idle process of its kind, or to a new one.
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
#include <list>
#include <map>
#include <thread>

#include "common/Error.h"
#include "replay/ReplayWire.h"
#include "replay/ReplayWorker.h"

namespace host {
namespace {

constexpr size_t kTaskMax = 16;     // gestures; fewer towards the end, so that all end together
constexpr size_t kWindowPart = 64;  // gestures under way for each process

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

    bool AtWork() const { return done < task.size(); }

    pid_t pid;
    int socket;
    bool doubleScan;
    std::vector<Item> task;
    size_t done = 0;  // of the task, answered
    wire::Receiver receiver;
};

int Wait(pid_t pid) {
    int status = 0;
    while (waitpid(pid, &status, 0) < 0 && errno == EINTR) {
    }
    return status;
}

ReplayResult Crashed(const GestureHead& head, int status) {
    ReplayResult result = ResultOfHead(head);
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
            while (AtWork() < m_limit && GiveTask()) {
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
                Queue& queue = head->mode == Mode::DoubleScan ? m_doubleScan : m_others;
                queue.emplace(m_listed++, std::move(*head));
            }
        }
    }

    size_t AtWork() const {
        return static_cast<size_t>(std::count_if(m_workers.begin(), m_workers.end(),
                                                 [](const Worker& w) { return w.AtWork(); }));
    }

    // Returns false when nothing waits.
    bool GiveTask() {
        if (m_doubleScan.empty() && m_others.empty())
            return false;
        const bool doubleScan =
            m_others.empty() ||
            (!m_doubleScan.empty() && m_doubleScan.begin()->first < m_others.begin()->first);
        Queue& queue = doubleScan ? m_doubleScan : m_others;
        Worker& worker = Idle(doubleScan);
        worker.task.clear();
        worker.done = 0;
        std::vector<GestureHead> heads;
        for (size_t left = std::clamp<size_t>(queue.size() / (2 * m_limit), 1, kTaskMax); left > 0;
             --left) {
            heads.push_back(queue.begin()->second);
            worker.task.push_back({queue.begin()->first, std::move(queue.begin()->second)});
            queue.erase(queue.begin());
        }
        // A process that is gone shows as the end of its stream.
        wire::Send(worker.socket, wire::Kind::Task, wire::EncodeTask(heads));
        return true;
    }

    Worker& Idle(bool doubleScan) {
        for (Worker& worker : m_workers) {
            if (worker.doubleScan == doubleScan && !worker.AtWork())
                return worker;
        }
        return Start(doubleScan);
    }

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
            const size_t index = worker->task[worker->done++].index;
            Deliver(index, wire::Decode(message->payload));
        }
        return open;
    }

    // The stream has ended: by a crash, if there was something to do.
    void Finish(const Worker& worker, int status) {
        if (!worker.AtWork())
            return;
        Queue& queue = worker.doubleScan ? m_doubleScan : m_others;
        for (size_t k = worker.done + 1; k < worker.task.size(); ++k)
            queue.emplace(worker.task[k].index, worker.task[k].head);
        const Item& item = worker.task[worker.done];
        Deliver(item.index, Crashed(item.head, status));
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

std::vector<ReplayResult> ReplayAll(const std::vector<Gesture>& gestures, int32_t processes) {
    ReplayJob job;
    job.processes = processes;
    job.next = [&gestures, index = size_t{0}]() mutable -> std::optional<GestureHead> {
        if (index == gestures.size())
            return std::nullopt;
        const Gesture& gesture = gestures[index];
        GestureHead head = {static_cast<int64_t>(index++),
                            gesture.id,
                            gesture.mode,
                            gesture.label,
                            gesture.tier,
                            static_cast<int32_t>(gesture.frames.size())};
        return head;
    };
    job.openReader = [&gestures] {
        return GestureReader([&gestures](const GestureHead& head) {
            return gestures[static_cast<size_t>(head.seq)];
        });
    };
    std::vector<ReplayResult> results;
    ReplayMany(job, [&results](size_t, const ReplayResult& result) { results.push_back(result); });
    return results;
}

}  // namespace host
