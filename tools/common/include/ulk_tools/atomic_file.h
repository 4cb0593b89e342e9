// Writing a file so that it is either complete or absent under its final name.
//
// Everything a tool writes goes first to a temporary name in the same folder (so the final
// rename stays on one file system and is atomic), and is renamed over the final name only
// once it is complete. A failed write removes the temporary file; a previous file of the
// final name stays untouched until the rename.
#ifndef ULK_TOOLS_ATOMIC_FILE_H
#define ULK_TOOLS_ATOMIC_FILE_H

#include <string>

namespace ulk_tools {

/// A temporary name beside path that keeps its extension (".out.ulk-tmp-<pid>.png" for
/// "out.png"), so writers that choose a format by extension still see the right one.
std::string TemporaryPathFor(const std::string& path);

/// Renames temporary over path. On failure the temporary file is removed and error says why.
bool CommitTemporary(const std::string& temporary, const std::string& path, std::string* error);

/// Writes contents to path through a temporary file. False with "PATH: reason" on failure.
bool WriteFileAtomically(const std::string& path, const std::string& contents, std::string* error);

/// Reads the whole file at path into contents. False with "PATH: reason" on failure.
bool ReadWholeFile(const std::string& path, std::string* contents, std::string* error);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_ATOMIC_FILE_H
