// A one-line progress bar for long renders.
//
//     [#####               ] 12/48 frames  23.4 fps  0:03 left
//
// It redraws in place (carriage return) on the stream, which must be a terminal: when the
// stream is not one (a log file, a pipe, CI) or the tool runs quiet, the bar prints nothing
// at all, so logs hold only real messages. Finish ends the line. One thread drives a bar.
#ifndef ULK_TOOLS_PROGRESS_H
#define ULK_TOOLS_PROGRESS_H

#include <chrono>
#include <cstdio>
#include <string>

namespace ulk_tools {

/// The bar's text for done of total frames after elapsed seconds, without '\r' or newline.
/// Speed and time left are left out until they can be estimated (nothing done, no time).
std::string FormatProgress(long long done, long long total, double elapsedSeconds);

/// "M:SS" or "H:MM:SS" for a number of seconds (rounded up, negatives as 0).
std::string FormatDuration(double seconds);

/// Progress of a fixed number of frames, drawn on a terminal.
class ProgressBar {
  public:
    /// A bar for total frames on stream; it draws only when the stream is a terminal and not
    /// quiet. The clock starts now.
    ProgressBar(long long total, bool quiet, std::FILE* stream = stderr);
    /// Ends the line if Finish was not called.
    ~ProgressBar();
    ProgressBar(const ProgressBar&) = delete;
    ProgressBar& operator=(const ProgressBar&) = delete;

    /// Records that done frames are complete and redraws (at most about ten times a second,
    /// and always for the last frame).
    void Update(long long done);
    /// Draws the final state and ends the line; later calls do nothing.
    void Finish();
    /// Whether this bar draws anything.
    bool Visible() const { return mVisible; }

  private:
    using Clock = std::chrono::steady_clock;
    void Draw();

    long long mTotal;
    long long mDone = 0;
    bool mVisible;
    bool mDrawn = false;
    bool mFinished = false;
    std::FILE* mStream;
    Clock::time_point mStart;
    Clock::time_point mLastDraw;
    size_t mLastLength = 0;
};

}  // namespace ulk_tools

#endif  // ULK_TOOLS_PROGRESS_H
