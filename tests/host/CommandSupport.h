// The command run to its end: exit code, output, and a limit against hanging.
#ifndef FPNAVI_TESTS_HOST_COMMANDSUPPORT_H
#define FPNAVI_TESTS_HOST_COMMANDSUPPORT_H

#include <sys/resource.h>

#include <cstdio>
#include <string>
#include <vector>

#include "HostTestSupport.h"
#include "ProcessSupport.h"

namespace host_test {

struct CommandEnd {
    int exitCode = -1;  // -1: ended by signal, SIGALRM if it hung
    int signal = 0;
    std::string err;
};

// Runs fpnavi with these words, stdout to out, its files limited to that many bytes each.
inline CommandEnd RunCommand(const std::vector<std::string>& arguments,
                             const std::string& out = "/dev/null",
                             rlim_t fileSizeMax = RLIM_INFINITY) {
    const std::string errPath = MemoryDirectory() + "/err";
    const pid_t child = InChild([&] {
        constexpr unsigned kHangSeconds = 120;
        alarm(kHangSeconds);
        const rlimit limit = {fileSizeMax, fileSizeMax};
        if (setrlimit(RLIMIT_FSIZE, &limit) != 0)
            return 125;
        std::vector<std::string> words = {FPNAVI_COMMAND};
        words.insert(words.end(), arguments.begin(), arguments.end());
        return Exec(words, out, errPath);
    });
    const int status = StatusOf(child);
    CommandEnd end;
    end.exitCode = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    end.signal = WIFSIGNALED(status) ? WTERMSIG(status) : 0;
    const std::vector<uint8_t> err = ReadBytes(errPath);
    end.err.assign(err.begin(), err.end());
    return end;
}

// The words as a shell would take them, for messages.
inline std::string Joined(const std::vector<std::string>& words) {
    std::string line;
    for (const std::string& word : words)
        line += (line.empty() ? "" : " ") + word;
    return line;
}

}  // namespace host_test

#endif  // FPNAVI_TESTS_HOST_COMMANDSUPPORT_H
