// Helpers for the frei0r bridge tests: the bridge opened as a host opens it,
// the host console captured, FREI0R_PATH, scratch folders, raw frames, ffmpeg.
#ifndef ULK_TESTS_FREI0R_FREI0R_HOST_H
#define ULK_TESTS_FREI0R_FREI0R_HOST_H

#include <dlfcn.h>
#include <gtest/gtest.h>
#include <stdarg.h>

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

#include "../samples/sample_host.h"

namespace fs = std::filesystem;
using Bytes = std::vector<unsigned char>;

inline std::string BridgePath() {
    return SamplePluginPath("frei0r-bridge");
}

/// What the host console received since the last Clear.
struct Console {
    static std::string& Text() {
        static std::string text;
        return text;
    }
    static int Print(const char* format, ...) {
        char buffer[4096];
        va_list args;
        va_start(args, format);
        const int n = std::vsnprintf(buffer, sizeof buffer, format, args);
        va_end(args);
        Text() += buffer;
        return n;
    }
    /// The lines that contain needle.
    static std::vector<std::string> Lines(const std::string& needle) {
        std::vector<std::string> lines;
        std::istringstream in(Text());
        for (std::string line; std::getline(in, line);)
            if (line.find(needle) != std::string::npos) lines.push_back(line);
        return lines;
    }
};

/// Sets FREI0R_PATH (null removes it) and puts the old value back.
class Frei0rPathGuard {
  public:
    explicit Frei0rPathGuard(const char* value) {
        const char* old = std::getenv("FREI0R_PATH");
        mHadOld = old != nullptr;
        if (old) mOld = old;
        value ? setenv("FREI0R_PATH", value, 1) : unsetenv("FREI0R_PATH");
    }
    ~Frei0rPathGuard() {
        mHadOld ? setenv("FREI0R_PATH", mOld.c_str(), 1) : unsetenv("FREI0R_PATH");
    }

  private:
    std::string mOld;
    bool mHadOld;
};

/// A fresh folder under the temporary folder, removed with its contents.
struct ScratchDir {
    ScratchDir() {
        std::string pattern = (fs::temp_directory_path() / "ulk-frei0r-XXXXXX").string();
        if (mkdtemp(pattern.data())) path = pattern;
    }
    ~ScratchDir() {
        std::error_code ignored;
        fs::remove_all(path, ignored);
    }
    fs::path path;
};

/// The bridge's model numbers by identifier for the current search path.
inline std::map<std::string, int> BridgeModelNumbers() {
    std::map<std::string, int> numbers;
    ulkHostModel keeper(0);  // keeps the bridge loaded while the others open and close
    const int count =
        keeper.Open(BridgePath().c_str(), 0, nullptr) ? keeper.GetDLL()->GetNumModels() : 0;
    for (int i = 0; i < count; ++i) {
        ulkHostModel model(static_cast<short>(i));
        if (model.Open(BridgePath().c_str(), 0, nullptr)) numbers[model.GetIdentifier()] = i;
    }
    return numbers;
}

/// One model of the bridge (from the folders searched) and one instance of it.
class BridgeEffect : public SampleEffect {
  public:
    explicit BridgeEffect(const std::string& identifier)
        : SampleEffect(BridgePath(), NumberOf(identifier)) {
        if (ok()) instance()->SetFrameRate(25.0);
    }

  private:
    static short NumberOf(const std::string& identifier) {
        static const std::map<std::string, int> numbers = BridgeModelNumbers();
        const auto found = numbers.find(identifier);
        return static_cast<short>(found == numbers.end() ? -1 : found->second);
    }
};

inline Bytes ReadFile(const fs::path& path) {
    std::ifstream in(path, std::ios::binary);
    return Bytes(std::istreambuf_iterator<char>(in), {});
}
inline void WriteFile(const fs::path& path, const Bytes& bytes) {
    std::ofstream(path, std::ios::binary)
        .write(reinterpret_cast<const char*>(bytes.data()),
               static_cast<std::streamsize>(bytes.size()));
}

/// Runs ffmpeg quietly with the arguments; true when it succeeded.
inline bool RunFfmpeg(const std::string& arguments) {
    return std::system(("ffmpeg -nostdin -hide_banner -loglevel error -y " + arguments).c_str()) ==
           0;
}

/// Tight RGBA bytes into a host image, and back out.
inline void LoadFrame(const unsigned char* rgba, HostImage& image) {
    image.Paint([&](int x, int y) {
        const unsigned char* p = rgba + (static_cast<size_t>(y) * image.width() + x) * 4;
        return Rgba{p[0], p[1], p[2], p[3]};
    });
}
inline void AppendFrame(const HostImage& image, Bytes* bytes) {
    for (int y = 0; y < image.height(); ++y)
        for (int x = 0; x < image.width(); ++x)
            for (int v : image.Get(x, y)) bytes->push_back(static_cast<unsigned char>(v));
}

/// libcairo (behind the cairo* and ndvi effects) allocates on load and never
/// frees; each time the bridge's shut-down unloads the last effect using it,
/// LeakSanitizer reports those blocks (a bare dlopen/dlclose of libcairo.so.2
/// shows the same). One reference held for the whole run keeps them reachable.
inline void KeepCairoLoaded() {
    static void* const cairo = dlopen("libcairo.so.2", RTLD_NOW | RTLD_LOCAL);
    (void)cairo;
}

/// Host services installed, FREI0R_PATH out of the way (the installed effects
/// are what the tests compare against), the console captured.
class Frei0rTest : public SampleTest {
  protected:
    void SetUp() override {
        KeepCairoLoaded();
        SampleTest::SetUp();
        Console::Text().clear();
        ulkHostGlobal::SetConsoleCallback(&Console::Print);
    }
    void TearDown() override {
        ulkHostGlobal::SetConsoleCallback(nullptr);
        SampleTest::TearDown();
    }

    Frei0rPathGuard mPath{nullptr};
};

#endif  // ULK_TESTS_FREI0R_FREI0R_HOST_H
