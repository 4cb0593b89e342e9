#include "ulk_tools/validate_process.h"

#include <fcntl.h>
#include <poll.h>
#include <signal.h>
#include <sys/wait.h>
#include <unistd.h>

#include <cerrno>
#include <chrono>
#include <cstdio>
#include <cstring>
#include <exception>
#include <thread>

namespace ulk_tools {

namespace {

using Clock = std::chrono::steady_clock;

int MillisecondsLeft(Clock::time_point deadline) {
    const auto left =
        std::chrono::duration_cast<std::chrono::milliseconds>(deadline - Clock::now()).count();
    return left > 0 ? static_cast<int>(left) : 0;
}

// Splits what arrived into complete lines; a partial line waits in pending.
void TakeLines(std::string* pending, std::vector<std::string>* lines) {
    size_t start = 0;
    for (size_t end; (end = pending->find('\n', start)) != std::string::npos; start = end + 1)
        lines->push_back(pending->substr(start, end - start));
    pending->erase(0, start);
}

// Waits for the child until the deadline; false when it is still running then.
bool WaitUntil(pid_t pid, Clock::time_point deadline, int* status) {
    for (;;) {
        const pid_t done = waitpid(pid, status, WNOHANG);
        if (done == pid || (done < 0 && errno != EINTR)) return true;
        if (MillisecondsLeft(deadline) == 0) return false;
        std::this_thread::sleep_for(std::chrono::milliseconds(5));
    }
}

[[noreturn]] void RunChild(int fd, const std::function<void(int fd)>& body) {
    // Whatever plug-in code prints goes with the diagnostics, not into the report.
    dup2(STDERR_FILENO, STDOUT_FILENO);
    // A crash must end the child with its signal, not in a handler inherited from the parent.
    for (int sig : {SIGSEGV, SIGBUS, SIGFPE, SIGILL, SIGABRT}) signal(sig, SIG_DFL);
    signal(SIGPIPE, SIG_IGN);
    // Nothing may unwind out of here: the child would go on running the parent's code.
    try {
        body(fd);
    } catch (const std::exception& e) {
        std::fprintf(stderr, "ulk-validate: an exception escaped a check: %s\n", e.what());
        _exit(70);
    } catch (...) {
        std::fprintf(stderr, "ulk-validate: an exception escaped a check\n");
        _exit(70);
    }
    std::fflush(stderr);
    close(fd);
    _exit(0);
}

}  // namespace

std::string ChildResult::EndingText(int timeoutSeconds) const {
    switch (ending) {
        case kExited:
            return "exited with status " + std::to_string(code) + " before finishing";
        case kSignalled:
            return "crashed with " + SignalName(code);
        case kTimedOut:
            return "timed out after " + std::to_string(timeoutSeconds) + " s";
        case kNotStarted:
            break;
    }
    return "could not be started: " + error;
}

bool WriteLine(int fd, const std::string& text) {
    const std::string line = text + "\n";
    size_t done = 0;
    while (done < line.size()) {
        const ssize_t n = write(fd, line.data() + done, line.size() - done);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0) return false;
        done += static_cast<size_t>(n);
    }
    return true;
}

std::string SignalName(int signal) {
    const char* name = sigabbrev_np(signal);
    return name ? std::string("SIG") + name : "signal " + std::to_string(signal);
}

ChildResult RunInChild(int timeoutSeconds, const std::function<void(int fd)>& body) {
    ChildResult result;
    int fds[2];
    if (pipe2(fds, O_CLOEXEC) != 0) {
        result.error = std::strerror(errno);
        return result;
    }
    // Buffered output would otherwise be written twice, once by each process.
    std::fflush(nullptr);
    const pid_t pid = fork();
    if (pid < 0) {
        result.error = std::strerror(errno);
        close(fds[0]);
        close(fds[1]);
        return result;
    }
    if (pid == 0) {
        close(fds[0]);
        RunChild(fds[1], body);
    }
    close(fds[1]);

    const Clock::time_point deadline = Clock::now() + std::chrono::seconds(timeoutSeconds);
    std::string pending;
    char buffer[4096];
    bool open = true;
    while (open && MillisecondsLeft(deadline) > 0) {
        pollfd wait = {fds[0], POLLIN, 0};
        const int ready = poll(&wait, 1, MillisecondsLeft(deadline));
        if (ready < 0 && errno != EINTR) break;
        if (ready <= 0) continue;
        const ssize_t n = read(fds[0], buffer, sizeof buffer);
        if (n < 0 && errno == EINTR) continue;
        if (n <= 0)
            open = false;  // the child closed its end: it is ending
        else
            pending.append(buffer, static_cast<size_t>(n));
        TakeLines(&pending, &result.lines);
    }
    close(fds[0]);

    int status = 0;
    if (!WaitUntil(pid, deadline, &status)) {
        kill(pid, SIGKILL);
        waitpid(pid, &status, 0);
        result.ending = ChildResult::kTimedOut;
    } else if (WIFSIGNALED(status)) {
        result.ending = ChildResult::kSignalled;
        result.code = WTERMSIG(status);
    } else {
        result.ending = ChildResult::kExited;
        result.code = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }
    return result;
}

}  // namespace ulk_tools
