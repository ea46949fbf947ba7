#include "Interrupt.h"

#include <atomic>
#include <csignal>
#include <cstdio>
#include <initializer_list>

namespace command {
namespace {

std::atomic<int> s_signal{0};
static_assert(std::atomic<int>::is_always_lock_free, "written by a signal handler");

void Note(int signal) {
    s_signal = signal;
}

}  // namespace

void CatchInterrupts() {
    for (const int signal : {SIGINT, SIGTERM, SIGHUP}) {
        struct sigaction former {};
        struct sigaction action {};
        action.sa_handler = Note;
        action.sa_flags = static_cast<int>(SA_RESETHAND) | SA_RESTART;
        if (sigaction(signal, nullptr, &former) == 0 && former.sa_handler != SIG_IGN)
            sigaction(signal, &action, nullptr);
    }
}

int InterruptingSignal() {
    return s_signal;
}

void EndByInterrupt() {
    const int signal = s_signal;
    if (signal == 0)
        return;
    std::fflush(nullptr);
    std::signal(signal, SIG_DFL);
    std::raise(signal);
}

}  // namespace command
