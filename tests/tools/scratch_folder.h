// A fresh folder under the system's temporary folder, removed with everything in it.
#ifndef ULK_TOOLS_TEST_SCRATCH_FOLDER_H
#define ULK_TOOLS_TEST_SCRATCH_FOLDER_H

#include <stdlib.h>

#include <algorithm>
#include <filesystem>
#include <string>
#include <vector>

class ScratchFolder {
  public:
    ScratchFolder() {
        std::string pattern =
            (std::filesystem::temp_directory_path() / "ulk-tools-XXXXXX").string();
        mPath = mkdtemp(pattern.data()) ? pattern : std::string();
    }
    ~ScratchFolder() {
        std::error_code ignored;
        if (!mPath.empty()) std::filesystem::remove_all(mPath, ignored);
    }
    ScratchFolder(const ScratchFolder&) = delete;
    ScratchFolder& operator=(const ScratchFolder&) = delete;

    /// Full path of name inside the folder.
    std::string Path(const std::string& name) const { return mPath + "/" + name; }

    /// Names of the files in the folder, sorted.
    std::vector<std::string> Names() const {
        std::vector<std::string> names;
        for (const auto& entry : std::filesystem::directory_iterator(mPath))
            names.push_back(entry.path().filename().string());
        std::sort(names.begin(), names.end());
        return names;
    }

  private:
    std::string mPath;
};

#endif  // ULK_TOOLS_TEST_SCRATCH_FOLDER_H
