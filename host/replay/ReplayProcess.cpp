#include "replay/ReplayProcess.h"

#include <fmt/core.h>
#include <poll.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <cerrno>
#include <csignal>
#include <cstring>
#include <deque>
#include <map>
#include <thread>

#include "common/Error.h"
#include "replay/ReplayWire.h"

namespace host {
namespace {

[[noreturn]] void Fail(const char* what, int reason) {
    throw Error("replay", "", fmt::format("{}: {}", what, std::strerror(reason)));
}

// What one child is to do. Whether a gesture is of double-scan mode shows only when it is read,
// so a child without double scan hands such gestures back, for a child that has it.
struct Task {
    std::vector<size_t> indices;  // of the ids, in the order in which the child replays them
    bool doubleScan = false;
};

struct Worker {
    pid_t pid = -1;
    int pipe = -1;
    Task task;
    size_t done = 0;  // of the task's indices, answered
    std::vector<size_t> handedBack;
    ReplayResult begun;    // what is known of the gesture that is being replayed
    std::string received;  // not yet a whole message
};

bool SendAnswer(const Task& task, const Gesture& gesture, const std::string& source, int pipe) {
    if (!task.doubleScan && gesture.mode == Mode::DoubleScan)
        return wire::Send(pipe, wire::Kind::HandedBack, "");
    return wire::Send(pipe, wire::Kind::Begun, wire::Encode(EmptyResult(gesture))) &&
           wire::Send(pipe, wire::Kind::Result, wire::Encode(ReplayHere(gesture, {}, source)));
}

// The child's life. Never returns.
[[noreturn]] void RunChild(const ReplayJob& job, const Task& task, int pipe) {
    bool sent = true;
    try {
        const GestureReader read = job.openReader();
        for (size_t k = 0; k < task.indices.size() && sent; ++k)
            sent = SendAnswer(task, read(task.indices[k]), job.source, pipe);
    } catch (const Error& error) {
        sent = wire::Send(pipe, wire::Kind::Error, wire::EncodeError(error.File(), error.what()));
    } catch (const std::exception& error) {
        sent = wire::Send(pipe, wire::Kind::Error, wire::EncodeError(job.source, error.what()));
    }
    _exit(sent ? 0 : 1);  // no exit: buffers and handlers are the parent's
}

class Pool {
  public:
    Pool(const ReplayJob& job, const ResultSink& sink) : m_job(job), m_sink(sink) {
        m_limit = job.processes > 0 ? static_cast<size_t>(job.processes)
                                    : std::max<size_t>(1, std::thread::hardware_concurrency());
        // All tasks advance through the ids together, so that few results have to wait.
        const size_t tasks = std::min(m_limit, job.ids.size());
        for (size_t k = 0; k < tasks; ++k) {
            Task task;
            for (size_t i = k; i < job.ids.size(); i += tasks)
                task.indices.push_back(i);
            m_queue.push_back(std::move(task));
        }
    }

    Pool(const Pool&) = delete;
    Pool& operator=(const Pool&) = delete;

    ~Pool() {  // only after an error are there any left
        for (const Worker& worker : m_workers) {
            kill(worker.pid, SIGKILL);
            close(worker.pipe);
            Wait(worker.pid);
        }
    }

    void Run() {
        while (!m_queue.empty() || !m_workers.empty()) {
            while (!m_queue.empty() && m_workers.size() < m_limit) {
                Start(std::move(m_queue.front()));
                m_queue.pop_front();
            }
            Receive();
        }
    }

  private:
    void Start(Task task) {
        int ends[2];
        if (pipe(ends) != 0)
            Fail("cannot open a pipe", errno);
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
                close(worker.pipe);  // else the others would not notice the parent's end
            RunChild(m_job, task, ends[1]);
        }
        close(ends[1]);
        Worker worker;
        worker.pid = pid;
        worker.pipe = ends[0];
        worker.task = std::move(task);
        m_workers.push_back(std::move(worker));
    }

    // Waits for the children to say something, and listens to each that does.
    void Receive() {
        std::vector<pollfd> polls;
        for (const Worker& worker : m_workers)
            polls.push_back({worker.pipe, POLLIN, 0});
        if (poll(polls.data(), polls.size(), -1) < 0) {
            if (errno == EINTR)
                return;
            Fail("cannot wait for a process", errno);
        }
        for (size_t i = polls.size(); i-- > 0;) {
            if (polls[i].revents != 0 && !Listen(&m_workers[i])) {
                Worker ended = std::move(m_workers[i]);
                m_workers.erase(m_workers.begin() + static_cast<std::ptrdiff_t>(i));
                close(ended.pipe);
                Finish(ended, Wait(ended.pid));
            }
        }
    }

    // Takes what has come. Returns false at the end of the pipe.
    bool Listen(Worker* worker) {
        char buffer[16384];
        const ssize_t count = read(worker->pipe, buffer, sizeof buffer);
        if (count < 0)
            return errno == EINTR;
        worker->received.append(buffer, static_cast<size_t>(count));
        wire::Message message;
        while (wire::Take(&worker->received, &message))
            Handle(message, worker);
        return count > 0;
    }

    void Handle(const wire::Message& message, Worker* worker) {
        if (message.kind == wire::Kind::Error)
            wire::ThrowError(message.payload);
        if (worker->done >= worker->task.indices.size())
            throw Error("replay", "", "a replaying process answered more than it was asked");
        const size_t index = worker->task.indices[worker->done];
        switch (message.kind) {
            case wire::Kind::Begun:
                worker->begun = wire::Decode(message.payload);
                break;
            case wire::Kind::HandedBack:
                worker->handedBack.push_back(index);
                ++worker->done;
                break;
            default:
                Deliver(index, wire::Decode(message.payload));
                ++worker->done;
                break;
        }
    }

    // The pipe has ended: with all answered, or by a crash.
    void Finish(const Worker& worker, int status) {
        const std::vector<size_t>& indices = worker.task.indices;
        if (!worker.handedBack.empty())
            m_queue.push_back({worker.handedBack, true});
        if (worker.done == indices.size())
            return;
        const size_t index = indices[worker.done];
        ReplayResult crashed;
        if (worker.begun.id == m_job.ids[index])
            crashed = worker.begun;
        crashed.id = m_job.ids[index];
        crashed.errors.push_back(
            WIFSIGNALED(status)
                ? fmt::format("the process replaying it ended by signal {}", WTERMSIG(status))
                : fmt::format("the process replaying it ended with status {}",
                              WEXITSTATUS(status)));
        Deliver(index, std::move(crashed));
        const auto rest = indices.begin() + static_cast<std::ptrdiff_t>(worker.done) + 1;
        if (rest != indices.end())
            m_queue.push_front({{rest, indices.end()}, worker.task.doubleScan});
    }

    // Keeps results until all before them have come.
    void Deliver(size_t index, ReplayResult result) {
        m_early.emplace(index, std::move(result));
        for (auto it = m_early.begin(); it != m_early.end() && it->first == m_next; ++m_next) {
            m_sink(it->first, it->second);
            it = m_early.erase(it);
        }
    }

    static int Wait(pid_t pid) {
        int status = 0;
        while (waitpid(pid, &status, 0) < 0 && errno == EINTR) {
        }
        return status;
    }

    const ReplayJob& m_job;
    const ResultSink& m_sink;
    size_t m_limit = 1;
    std::deque<Task> m_queue;
    std::vector<Worker> m_workers;
    std::map<size_t, ReplayResult> m_early;
    size_t m_next = 0;
};

}  // namespace

void ReplayMany(const ReplayJob& job, const ResultSink& sink) {
    Pool(job, sink).Run();
}

std::vector<ReplayResult> ReplayAll(const std::vector<Gesture>& gestures, int32_t processes) {
    ReplayJob job;
    job.processes = processes;
    for (const Gesture& gesture : gestures)
        job.ids.push_back(gesture.id);
    job.openReader = [&gestures] {
        return GestureReader([&gestures](size_t index) { return gestures[index]; });
    };
    std::vector<ReplayResult> results;
    ReplayMany(job, [&results](size_t, const ReplayResult& result) { results.push_back(result); });
    return results;
}

}  // namespace host
