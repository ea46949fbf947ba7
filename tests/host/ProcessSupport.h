// Processes for tests: started with their output in files, waited for, killed.
#ifndef FPNAVI_TESTS_HOST_PROCESSSUPPORT_H
#define FPNAVI_TESTS_HOST_PROCESSSUPPORT_H

#include <fcntl.h>
#include <gtest/gtest.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cstdlib>
#include <string>
#include <vector>

namespace host_test {

// A whole number from the environment.
inline uint64_t NumberFromEnvironment(const char* name, uint64_t otherwise) {
    const char* const text = std::getenv(name);
    return text == nullptr ? otherwise : std::strtoull(text, nullptr, 10);
}

// Runs action in a child process; its result is the exit code.
template <typename Action>
pid_t InChild(Action action) {
    const pid_t child = fork();
    if (child == 0)
        _exit(action());
    return child;
}

// What waitpid says of a child's end.
inline int StatusOf(pid_t child) {
    int status = 0;
    EXPECT_EQ(waitpid(child, &status, 0), child);
    return status;
}

// Becomes a program, its stdout and stderr going to a file each. Returns only when it cannot.
inline int Exec(const std::vector<std::string>& words, const std::string& outPath,
                const std::string& errPath) {
    std::vector<char*> arguments;
    arguments.reserve(words.size() + 1);
    for (const std::string& word : words)
        arguments.push_back(const_cast<char*>(word.c_str()));
    arguments.push_back(nullptr);
    const int out = open(outPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    const int err = open(errPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0600);
    if (dup2(out, STDOUT_FILENO) < 0 || dup2(err, STDERR_FILENO) < 0)
        return 126;
    execv(arguments[0], arguments.data());
    return 127;
}

}  // namespace host_test

#endif  // FPNAVI_TESTS_HOST_PROCESSSUPPORT_H
