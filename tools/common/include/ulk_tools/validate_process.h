// Running a piece of work in a child process with a time limit, for ulk-validate: a plug-in
// that crashes or hangs there takes only the child with it.
//
// The child writes lines to a pipe; the parent collects them until the child ends or the limit
// passes, when it kills the child. The child's standard output goes to standard error, so
// that whatever plug-in code prints never mixes with the parent's report. Call from the one
// thread of a process that has started no other thread.
#ifndef ULK_TOOLS_VALIDATE_PROCESS_H
#define ULK_TOOLS_VALIDATE_PROCESS_H

#include <functional>
#include <string>
#include <vector>

namespace ulk_tools {

/// How a child process ended and what it wrote.
struct ChildResult {
    enum Ending { kExited, kSignalled, kTimedOut, kNotStarted };
    Ending ending = kNotStarted;
    int code = 0;                    ///< exit status (kExited) or signal number (kSignalled)
    std::vector<std::string> lines;  ///< the complete lines written to the pipe, in order
    std::string error;               ///< why the child could not be started (kNotStarted)

    /// "exited with status 3", "crashed with SIGSEGV", "timed out after 20 s", ...
    std::string EndingText(int timeoutSeconds) const;
};

/// Forks; the child runs body(fd) with fd the pipe's writing end and then ends with _exit(0)
/// (no exit handlers run in it), or _exit(70) when an exception leaves body. The parent waits at most timeoutSeconds, then kills it.
ChildResult RunInChild(int timeoutSeconds, const std::function<void(int fd)>& body);

/// Writes text and a newline to fd whole, retrying short writes; false when the pipe broke.
bool WriteLine(int fd, const std::string& text);

/// "SIGSEGV", "SIGABRT", ...; "signal N" for a number without a name.
std::string SignalName(int signal);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_VALIDATE_PROCESS_H
