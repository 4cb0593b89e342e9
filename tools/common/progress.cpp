#include "ulk_tools/progress.h"

#include <unistd.h>

#include <algorithm>
#include <cmath>

namespace ulk_tools {

namespace {

constexpr int kBarWidth = 20;

}  // namespace

std::string FormatDuration(double seconds) {
    if (!(seconds > 0)) seconds = 0;
    seconds = std::min(seconds, 359999.0);  // 99:59:59 keeps the line's width bounded
    const long long total = static_cast<long long>(std::ceil(seconds));
    const long long h = total / 3600;
    const long long m = total / 60 % 60;
    const long long s = total % 60;
    char buffer[32];
    if (h > 0)
        std::snprintf(buffer, sizeof buffer, "%lld:%02lld:%02lld", h, m, s);
    else
        std::snprintf(buffer, sizeof buffer, "%lld:%02lld", m, s);
    return buffer;
}

std::string FormatProgress(long long done, long long total, double elapsedSeconds) {
    if (total < 0) total = 0;
    done = std::clamp(done, 0LL, total);
    const int filled = total > 0 ? static_cast<int>(done * kBarWidth / total) : kBarWidth;
    std::string text = "[" + std::string(filled, '#') + std::string(kBarWidth - filled, ' ') +
                       "] " + std::to_string(done) + "/" + std::to_string(total) + " frames";
    if (done > 0 && elapsedSeconds > 0) {
        const double fps = done / elapsedSeconds;
        char buffer[32];
        std::snprintf(buffer, sizeof buffer, "  %.1f fps", fps);
        text += buffer;
        text += "  " + FormatDuration((total - done) / fps) + " left";
    }
    return text;
}

ProgressBar::ProgressBar(long long total, bool quiet, std::FILE* stream)
    : mTotal(total),
      mVisible(!quiet && stream && isatty(fileno(stream))),
      mStream(stream),
      mStart(Clock::now()),
      mLastDraw(mStart) {}

ProgressBar::~ProgressBar() {
    Finish();
}

void ProgressBar::Update(long long done) {
    mDone = done;
    if (!mVisible || mFinished) return;
    const Clock::time_point now = Clock::now();
    if (mDrawn && done < mTotal && now - mLastDraw < std::chrono::milliseconds(100)) return;
    mLastDraw = now;
    Draw();
}

void ProgressBar::Finish() {
    if (mFinished) return;
    mFinished = true;
    if (!mVisible) return;
    Draw();
    std::fputc('\n', mStream);
    std::fflush(mStream);
}

void ProgressBar::Draw() {
    const double elapsed = std::chrono::duration<double>(Clock::now() - mStart).count();
    std::string line = FormatProgress(mDone, mTotal, elapsed);
    // A shorter line than the last one would leave its tail on screen.
    const size_t length = line.size();
    if (length < mLastLength) line.append(mLastLength - length, ' ');
    mLastLength = length;
    std::fprintf(mStream, "\r%s", line.c_str());
    std::fflush(mStream);
    mDrawn = true;
}

}  // namespace ulk_tools
