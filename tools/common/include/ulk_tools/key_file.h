// Key files: parameter keys as text, one per line, read by --keys and written by --save-keys.
//
//     # comment lines start with '#' (after optional blanks); blank lines are skipped
//     ID TIME TEXT
//
// ID is one word, TIME a real number, TEXT the rest of the line (spaces and '#' included;
// possibly empty), as the parameter's own text form writes it. Blanks between the fields are
// spaces or tabs; those before TEXT are separators, so a text cannot start with a blank.
// Lines end with LF or CRLF. The parser is a pure function of its input and accepts any
// bytes without faulting; the first malformed line stops it with "FILE:LINE: message".
#ifndef ULK_TOOLS_KEY_FILE_H
#define ULK_TOOLS_KEY_FILE_H

#include <string>
#include <string_view>
#include <vector>

namespace ulk_tools {

/// One key of a key file.
struct KeyLine {
    std::string id;    ///< the parameter's identifier
    double time = 0;   ///< the key's time
    std::string text;  ///< the value as text
    int line = 0;      ///< line number in the file it was read from (1-based); 0 if made otherwise
};

/// Parses the text of a key file; fileName only names it in messages. False with
/// "FILE:LINE: message" at the first malformed line (keys then holds the lines before it).
bool ParseKeyText(std::string_view content, const std::string& fileName, std::vector<KeyLine>* keys,
                  std::string* error);

/// The text of a key file holding keys, in order. False with a message naming the key when a
/// key cannot be written so that it reads back the same (an ID that is empty or has blanks,
/// a text with a line break or a leading blank, a time that is not finite).
bool FormatKeyText(const std::vector<KeyLine>& keys, std::string* content, std::string* error);

/// Reads and parses the key file at path.
bool ReadKeyFile(const std::string& path, std::vector<KeyLine>* keys, std::string* error);

/// Writes keys to path through a temporary file renamed when complete.
bool WriteKeyFile(const std::string& path, const std::vector<KeyLine>& keys, std::string* error);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_KEY_FILE_H
