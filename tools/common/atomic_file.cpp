#include "ulk_tools/atomic_file.h"

#include <unistd.h>

#include <cerrno>
#include <cstdio>
#include <cstring>

namespace ulk_tools {

namespace {

std::string SystemError(const std::string& path) {
    return path + ": " + std::strerror(errno);
}

}  // namespace

std::string TemporaryPathFor(const std::string& path) {
    const size_t slash = path.find_last_of('/');
    const std::string folder = slash == std::string::npos ? "" : path.substr(0, slash + 1);
    const std::string name = slash == std::string::npos ? path : path.substr(slash + 1);
    const size_t dot = name.find_last_of('.');
    const std::string stem = dot == std::string::npos || dot == 0 ? name : name.substr(0, dot);
    const std::string extension = dot == std::string::npos || dot == 0 ? "" : name.substr(dot);
    // Hidden and tagged with the process id: two tools writing the same folder never collide,
    // and a leftover after a crash is recognisable.
    return folder + "." + stem + ".ulk-tmp-" + std::to_string(getpid()) + extension;
}

bool CommitTemporary(const std::string& temporary, const std::string& path, std::string* error) {
    if (std::rename(temporary.c_str(), path.c_str()) != 0) {
        *error = SystemError(path);
        std::remove(temporary.c_str());
        return false;
    }
    return true;
}

bool WriteFileAtomically(const std::string& path, const std::string& contents, std::string* error) {
    const std::string temporary = TemporaryPathFor(path);
    FILE* file = std::fopen(temporary.c_str(), "wb");
    if (!file) {
        *error = SystemError(path);
        return false;
    }
    const bool written = std::fwrite(contents.data(), 1, contents.size(), file) == contents.size();
    const int savedErrno = errno;
    // fclose flushes: a full disk may only show here.
    const bool closed = std::fclose(file) == 0;
    if (!written || !closed) {
        if (!written) errno = savedErrno;
        *error = SystemError(path);
        std::remove(temporary.c_str());
        return false;
    }
    return CommitTemporary(temporary, path, error);
}

bool ReadWholeFile(const std::string& path, std::string* contents, std::string* error) {
    FILE* file = std::fopen(path.c_str(), "rb");
    if (!file) {
        *error = SystemError(path);
        return false;
    }
    contents->clear();
    char buffer[65536];
    size_t count = 0;
    while ((count = std::fread(buffer, 1, sizeof buffer, file)) > 0)
        contents->append(buffer, count);
    const bool failed = std::ferror(file) != 0;
    const int savedErrno = errno;
    std::fclose(file);
    if (failed) {
        errno = savedErrno;
        *error = SystemError(path);
        return false;
    }
    return true;
}

}  // namespace ulk_tools
