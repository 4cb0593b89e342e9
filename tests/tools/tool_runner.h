// Runs a built tool as a separate process and collects what it printed and its exit status.
#ifndef ULK_TOOLS_TEST_TOOL_RUNNER_H
#define ULK_TOOLS_TEST_TOOL_RUNNER_H

#include <fcntl.h>
#include <spawn.h>
#include <sys/wait.h>
#include <unistd.h>

#include <fstream>
#include <sstream>
#include <string>
#include <vector>

extern char** environ;

struct ToolResult {
    int status = -1;  ///< exit status, or -1 when the process did not exit normally
    std::string out;  ///< standard output
    std::string err;  ///< standard error
};

inline std::string ReadTextFile(const std::string& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

/// Runs program with arguments; standard input comes from stdinPath ("" for /dev/null) and
/// the two output streams are caught in files inside folder.
inline ToolResult RunTool(const std::string& program, const std::vector<std::string>& arguments,
                          const std::string& folder, const std::string& stdinPath = "") {
    const std::string outPath = folder + "/.stdout", errPath = folder + "/.stderr";
    posix_spawn_file_actions_t actions;
    posix_spawn_file_actions_init(&actions);
    posix_spawn_file_actions_addopen(
        &actions, 0, stdinPath.empty() ? "/dev/null" : stdinPath.c_str(), O_RDONLY, 0);
    posix_spawn_file_actions_addopen(&actions, 1, outPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                     0644);
    posix_spawn_file_actions_addopen(&actions, 2, errPath.c_str(), O_WRONLY | O_CREAT | O_TRUNC,
                                     0644);
    std::vector<std::string> all{program};
    all.insert(all.end(), arguments.begin(), arguments.end());
    std::vector<char*> argv;
    for (std::string& argument : all) argv.push_back(argument.data());
    argv.push_back(nullptr);
    ToolResult result;
    pid_t pid = 0;
    if (posix_spawn(&pid, program.c_str(), &actions, nullptr, argv.data(), environ) == 0) {
        int status = 0;
        waitpid(pid, &status, 0);
        result.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
    }
    posix_spawn_file_actions_destroy(&actions);
    result.out = ReadTextFile(outPath);
    result.err = ReadTextFile(errPath);
    unlink(outPath.c_str());
    unlink(errPath.c_str());
    return result;
}

#endif  // ULK_TOOLS_TEST_TOOL_RUNNER_H
