// Helpers for the frei0r bridge tests: the bridge opened as a host opens it,
// the host console captured, scratch folders, raw RGBA frames and ffmpeg.
#ifndef ULK_TESTS_FREI0R_FREI0R_HOST_H
#define ULK_TESTS_FREI0R_FREI0R_HOST_H

#include <gtest/gtest.h>
#include <stdarg.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <string>
#include <vector>

#include "../samples/sample_host.h"

namespace fs = std::filesystem;

inline std::string BridgePath() {
    return SamplePluginPath("frei0r-bridge");
}

/// Everything printed on the host console while installed.
class ConsoleCapture {
  public:
    ConsoleCapture() {
        Text().clear();
        ulkHostGlobal::SetConsoleCallback(&Print);
    }
    ~ConsoleCapture() { ulkHostGlobal::SetConsoleCallback(nullptr); }
    static std::string& Text() {
        static std::string text;
        return text;
    }
    /// The lines that contain needle.
    static std::vector<std::string> Lines(const std::string& needle) {
        std::vector<std::string> lines;
        size_t start = 0;
        const std::string& text = Text();
        while (start < text.size()) {
            size_t end = text.find('\n', start);
            if (end == std::string::npos) end = text.size();
            const std::string line = text.substr(start, end - start);
            if (line.find(needle) != std::string::npos) lines.push_back(line);
            start = end + 1;
        }
        return lines;
    }

  private:
    static int Print(const char* format, ...) {
        char buffer[4096];
        va_list args;
        va_start(args, format);
        const int n = std::vsnprintf(buffer, sizeof buffer, format, args);
        va_end(args);
        Text() += buffer;
        return n;
    }
};

/// A folder under the system's temporary folder, removed with its contents.
class ScratchDir {
  public:
    ScratchDir() {
        std::string pattern = (fs::temp_directory_path() / "ulk-frei0r-XXXXXX").string();
        if (mkdtemp(pattern.data())) mPath = pattern;
    }
    ~ScratchDir() {
        std::error_code ignored;
        if (!mPath.empty()) fs::remove_all(mPath, ignored);
    }
    ScratchDir(const ScratchDir&) = delete;
    ScratchDir& operator=(const ScratchDir&) = delete;
    const fs::path& path() const { return mPath; }

  private:
    fs::path mPath;
};

/// Sets FREI0R_PATH (or removes it, for null) and restores the old value.
class Frei0rPathGuard {
  public:
    explicit Frei0rPathGuard(const char* value) {
        if (const char* old = std::getenv("FREI0R_PATH")) mOld = old, mHadOld = true;
        if (value)
            setenv("FREI0R_PATH", value, 1);
        else
            unsetenv("FREI0R_PATH");
    }
    ~Frei0rPathGuard() {
        if (mHadOld)
            setenv("FREI0R_PATH", mOld.c_str(), 1);
        else
            unsetenv("FREI0R_PATH");
    }

  private:
    std::string mOld;
    bool mHadOld = false;
};

/// The bridge's models by identifier, read once per search path: model
/// numbers are stable for one set of installed effects.
inline std::map<std::string, int> BridgeModelNumbers() {
    std::map<std::string, int> numbers;
    ulkHostModel keeper(0);  // holds the bridge loaded while the others open and close
    if (!keeper.Open(BridgePath().c_str(), 0, nullptr)) return numbers;
    const int count = keeper.GetDLL()->GetNumModels();
    for (int i = 0; i < count; ++i) {
        ulkHostModel model(static_cast<short>(i));
        if (model.Open(BridgePath().c_str(), 0, nullptr)) numbers[model.GetIdentifier()] = i;
        model.Close();
    }
    keeper.Close();
    return numbers;
}

/// One model of the bridge and one instance of it, closed on destruction.
class BridgeEffect {
  public:
    explicit BridgeEffect(const std::string& identifier) : mModel(NumberOf(identifier)) {
        mOpened = mModel.Open(BridgePath().c_str(), 0, nullptr);
        if (mOpened) mInstance = mModel.NewInstance();
        if (mInstance) {
            mInstance->SetVideoType(kVideoTypeProgressive);
            mInstance->SetFrameRate(25.0);
            SetFrame(0, 1);
        }
    }
    ~BridgeEffect() {
        if (mInstance) mModel.DeleteInstance(mInstance);
        mModel.Close();
    }
    BridgeEffect(const BridgeEffect&) = delete;
    BridgeEffect& operator=(const BridgeEffect&) = delete;

    bool ok() const { return mOpened && mInstance != nullptr; }
    ulkHostModel& model() { return mModel; }
    ulkHostInstance* instance() const { return mInstance; }
    ulkParameter* Param(const char* id) const { return mInstance->FindParameter(id); }
    /// Sets a parameter from its text form at time 0 (one key: constant).
    bool Set(const char* id, const char* text) const {
        ulkParameter* param = Param(id);
        return param && param->ParseValue(0.0, text);
    }
    void SetFrame(int frame, int frames) {
        mInstance->SetTotalFrames(frames);
        mInstance->SetCurrentFrame(frame);
    }
    /// Runs the effect with the given inputs (0 to 3) into out.
    bool Run(const std::vector<HostImage*>& inputs, HostImage& out) {
        for (size_t i = 0; i < inputs.size(); ++i)
            if (!mInstance->SetInput(static_cast<int>(i), inputs[i]->get())) return false;
        return mInstance->SetOutput(0, out.get()) && mInstance->Execute(nullptr);
    }

  private:
    static short NumberOf(const std::string& identifier) {
        static std::map<std::string, int> numbers;  // the default search path's
        if (numbers.empty()) numbers = BridgeModelNumbers();
        const auto found = numbers.find(identifier);
        return static_cast<short>(found == numbers.end() ? -1 : found->second);
    }

    ulkHostModel mModel;
    bool mOpened = false;
    ulkHostInstance* mInstance = nullptr;
};

/// Raw RGBA frames, one after another, as ffmpeg's rawvideo writes them.
inline std::vector<unsigned char> ReadFile(const fs::path& path) {
    std::ifstream in(path, std::ios::binary);
    return std::vector<unsigned char>(std::istreambuf_iterator<char>(in), {});
}
inline void WriteFile(const fs::path& path, const std::vector<unsigned char>& bytes) {
    std::ofstream out(path, std::ios::binary);
    out.write(reinterpret_cast<const char*>(bytes.data()),
              static_cast<std::streamsize>(bytes.size()));
}

/// Runs ffmpeg quietly with the arguments; true when it succeeded.
inline bool RunFfmpeg(const std::string& arguments) {
    const std::string command = "ffmpeg -nostdin -hide_banner -loglevel error -y " + arguments;
    return std::system(command.c_str()) == 0;
}

/// Copies frame pixels (width x height RGBA, tight) into a host image and back.
inline void LoadFrame(const unsigned char* rgba, HostImage& image) {
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x) {
            const unsigned char* p = rgba + (static_cast<size_t>(y) * image.width() + x) * 4;
            image.Put(x, y, {p[0], p[1], p[2], p[3]});
        }
}
inline std::vector<unsigned char> SaveFrame(const HostImage& image) {
    std::vector<unsigned char> bytes;
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
            for (int v : image.Get(x, y)) bytes.push_back(static_cast<unsigned char>(v));
    return bytes;
}

/// The test fixture: host services installed, FREI0R_PATH out of the way
/// (the installed effects are what the tests compare against), console captured.
class Frei0rTest : public SampleTest {
  protected:
    Frei0rPathGuard mPath{nullptr};
    ConsoleCapture mConsole;
};

#endif  // ULK_TESTS_FREI0R_FREI0R_HOST_H
