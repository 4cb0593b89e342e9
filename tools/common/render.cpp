#include "ulk_tools/render.h"

#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <condition_variable>
#include <memory>
#include <mutex>
#include <thread>

#include "ulk_tools/effect.h"
#include "ulk_tools/frame_image.h"
#include "ulk_tools/image_io.h"
#include "ulk_tools/key_file.h"
#include "ulk_tools/progress.h"
#include "ulk_tools/raw_stream.h"
#include "ulk_tools/sequence.h"
#include "ulk_tools/test_pattern.h"

namespace ulk_tools {

namespace {

// Size of "pattern" when nothing else gives one.
constexpr int kDefaultWidth = 640;
constexpr int kDefaultHeight = 360;

// ---------------------------------------------------------------- inputs

enum class SourceKind { kStill, kSequence, kPattern, kStream };

struct Source {
    SourceKind kind = SourceKind::kStill;
    std::string name;
    SequencePattern sequence;
    Frame still;  // kStill: the picture, read once
    int width = 0, height = 0;
};

bool IsStream(const std::string& name) {
    return name == "-";
}

bool ParseSource(const std::string& text, const RenderSettings& settings, Source* source,
                 std::string* error) {
    source->name = text;
    if (IsStream(text)) {
        if (!settings.raw) {
            *error = "input '-' reads raw RGBA frames: give their size with --raw WxH";
            return false;
        }
        source->kind = SourceKind::kStream;
        source->width = settings.rawWidth;
        source->height = settings.rawHeight;
        return true;
    }
    if (text == "pattern" || text.rfind("pattern:", 0) == 0) {
        source->kind = SourceKind::kPattern;
        if (text.size() > 7 && !ParseSize(text.substr(8), &source->width, &source->height, error)) {
            *error = "input '" + text + "': " + *error;
            return false;
        }
        return true;
    }
    if (IsSequencePattern(text)) {
        source->kind = SourceKind::kSequence;
        if (!ParseSequencePattern(text, &source->sequence, error)) {
            *error = "input '" + text + "': " + *error;
            return false;
        }
        return true;
    }
    source->kind = SourceKind::kStill;
    return true;
}

// Reads the picture of a file or a sequence frame and checks its size.
bool ReadSized(const std::string& path, int width, int height, Frame* frame, std::string* error) {
    if (!ReadImage(path, frame, error)) return false;
    if (frame->Width() != width || frame->Height() != height) {
        *error = path + ": " + SizeText(frame->Width(), frame->Height()) + ", but the frames are " +
                 SizeText(width, height) + " (inputs must all have one size)";
        return false;
    }
    return true;
}

// ---------------------------------------------------------------- pixel formats

// Orders the tools can hand an effect, most preferred first (RGBA needs no reordering).
const ulkImgFormat kOrders[] = {kImgFormatRGBA, kImgFormatBGRA, kImgFormatARGB,
                                kImgFormatABGR, kImgFormatRGB,  kImgFormatBGR};

bool Accepts(const ulkHostModel& model, ulkImgFormat order) {
    for (int i = 0; i < model.GetNumFormats(); ++i) {
        const ulkImageFormat* format = model.GetFormat(i);
        const bool code = format->GetFormat() == order || format->GetFormat() == kImgFormatAny;
        if (code && (format->GetBitDepth() == 8 || format->GetBitDepth() == 0)) return true;
    }
    return false;
}

bool ChooseOrder(const Effect& effect, ulkImgFormat* order, std::string* note, std::string* error) {
    for (ulkImgFormat candidate : kOrders) {
        if (!Accepts(*effect.Model(), candidate)) continue;
        *order = candidate;
        if (candidate != kImgFormatRGBA)
            *note = effect.Name() + " does not take 8-bit RGBA; frames are converted to " +
                    ImageFormatText(candidate) + " and back";
        return true;
    }
    std::string formats;
    for (int i = 0; i < effect.Model()->GetNumFormats(); ++i) {
        const ulkImageFormat* format = effect.Model()->GetFormat(i);
        formats += (i ? ", " : "") + ImageFormatText(format->GetFormat()) + " " +
                   std::to_string(format->GetBitDepth()) + "-bit";
    }
    *error = effect.Name() + " takes none of the formats frames can be converted to " +
             "(8-bit RGBA, BGRA, ARGB, ABGR, RGB, BGR); it takes: " +
             (formats.empty() ? "nothing" : formats);
    return false;
}

// An image in the effect's pixel format with pixels of its own, made once per worker and
// reused for every frame.
class EffectImage {
  public:
    EffectImage() = default;
    EffectImage(const EffectImage&) = delete;
    EffectImage& operator=(const EffectImage&) = delete;
    ~EffectImage() {
        if (mBuffer) mImage->FreeBuffer(mBuffer);
    }

    bool Make(ulkImgFormat order, int width, int height) {
        mOrder = order;
        if (IsFourChannelOrder(order)) {
            if (!mPixels.Allocate(width, height)) return false;
            mImage = WrapFrame(mPixels, order);
            return mImage != nullptr;
        }
        mImage.reset(ulkImage::New());
        if (!mImage) return false;
        ulkImageFormat format;
        format.SetFormat(order);
        format.SetBitDepth(8);
        mImage->SetFormat(&format);
        mImage->SetSize(width, height);
        mBuffer = mImage->CreateBuffer();
        return mBuffer != nullptr;
    }

    ulkImage* Image() const { return mImage.get(); }
    /// The image's own pixels as an RGBA frame when the image is RGBA, so that pictures go
    /// in and out without a conversion; null for any other order.
    Frame* RgbaPixels() { return mImage && mOrder == kImgFormatRGBA ? &mPixels : nullptr; }

  private:
    ulkImgFormat mOrder = kImgFormatAny;
    Frame mPixels;
    ImagePtr mImage;
    void* mBuffer = nullptr;
};

// ---------------------------------------------------------------- workers

// One thread's effect and pictures.
struct Worker {
    Effect effect;
    std::vector<std::unique_ptr<EffectImage>> inputs;
    EffectImage output;
    std::vector<Frame> scratch;  // RGBA pictures converted into inputs that are not RGBA
    Frame result;                // the output as RGBA when the effect's order is another

    // Where input i's RGBA picture is made or read: into the input image itself when it is
    // RGBA, else into the scratch picture it is converted from.
    Frame* Picture(size_t i) {
        Frame* direct = inputs[i]->RgbaPixels();
        return direct ? direct : &scratch[i];
    }
};

// The job as the workers see it: read-only while they run.
struct Job {
    const RenderSettings* settings = nullptr;
    std::vector<Source> sources;
    int width = 0, height = 0;
    int stream = -1;      // the source read from the raw input stream, or -1
    bool rawOut = false;  // results go to the raw output stream in frame order, else to files
};

// Renders frame with worker, whose stream picture (if any) has been read already. Answers the
// result as RGBA (the output image's own pixels when it is RGBA), or null with a message.
const Frame* RenderFrame(const Job& job, Worker* worker, int frame, std::string* error) {
    const std::string at = "frame " + std::to_string(frame) + ": ";
    for (size_t i = 0; i < job.sources.size(); ++i) {
        const Source& source = job.sources[i];
        // An RGBA picture still to be converted into the input image, if any.
        const Frame* picture = worker->Picture(i);
        switch (source.kind) {
            case SourceKind::kStill:
                picture = &source.still;
                break;
            case SourceKind::kStream:
                break;
            case SourceKind::kPattern:
                FillTestPattern(worker->Picture(i), frame);
                break;
            case SourceKind::kSequence:
                if (!ReadSized(SequenceFramePath(source.sequence, frame), job.width, job.height,
                               &worker->scratch[i], error))
                    return nullptr;
                picture = &worker->scratch[i];
                break;
        }
        if (picture != worker->inputs[i]->RgbaPixels() &&
            !CopyFrameToImage(*picture, worker->inputs[i]->Image(), error)) {
            *error = at + *error;
            return nullptr;
        }
    }
    ulkHostInstance* instance = worker->effect.Instance();
    instance->SetCurrentFrame(frame);
    const ulkBounds bounds = {0, 0, job.width - 1, job.height - 1};
    if (!instance->Execute(&bounds)) {
        *error = at + worker->effect.Name() + " failed: " + instance->GetErrorString();
        return nullptr;
    }
    // An in-place effect with nothing to do leaves the picture to the host: its input is
    // the output then.
    if (!job.sources.empty() && !instance->HasEffect() && instance->InPlace() &&
        !worker->output.Image()->Copy(worker->inputs[0]->Image(), nullptr)) {
        *error = at + "cannot pass the input through";
        return nullptr;
    }
    if (const Frame* direct = worker->output.RgbaPixels()) return direct;
    if (!CopyImageToFrame(*worker->output.Image(), &worker->result, error)) {
        *error = at + *error;
        return nullptr;
    }
    return &worker->result;
}

// Runs the frames on the workers. Each worker in turn takes the next frame number and reads
// its stream picture straight into its own input (so frames are read in order), renders,
// and writes its result: a file at once, a raw frame once every frame before it is written
// (so frames are written in order). Reading, rendering and writing of different frames
// overlap, every worker keeps its pictures from frame to frame, and no more than one frame a
// worker is ever held. On a failure no new frame starts; frames before the earliest failing
// one are still completed, later ones are dropped, and that frame's message is reported.
class Schedule {
  public:
    Schedule(const Job& job, const FrameRange& range, bool openEnded)
        : mJob(job),
          mRange(range),
          mOpenEnded(openEnded),
          mNext(range.first),
          mNextWrite(range.first) {}

    // One worker renders on the calling thread; more run on threads of their own while the
    // calling thread draws progress, so that every instance stays on one thread.
    bool Run(const std::vector<std::unique_ptr<Worker>>& workers, ProgressBar* bar,
             std::string* error) {
        if (workers.size() == 1) {
            Work(workers[0].get(), bar);
        } else {
            mRunning = workers.size();
            std::vector<std::thread> threads;
            for (const auto& worker : workers)
                threads.emplace_back([this, &worker] { Work(worker.get(), nullptr); });
            std::unique_lock<std::mutex> lock(mMutex);
            while (mRunning > 0) {
                mChanged.wait_for(lock, std::chrono::milliseconds(100));
                const long long done = mDone;
                lock.unlock();
                bar->Update(done);
                lock.lock();
            }
            lock.unlock();
            for (std::thread& thread : threads) thread.join();
        }
        if (mFailed) *error = mError;
        return !mFailed;
    }

    long long Done() const { return mDone; }

  private:
    void Work(Worker* worker, ProgressBar* bar) {
        int frame = 0;
        while (Take(worker, &frame)) {
            std::string error;
            const Frame* result = RenderFrame(mJob, worker, frame, &error);
            Complete(frame, result, error);
            if (bar) bar->Update(mDone);  // only with one worker, on its own thread
        }
        std::lock_guard<std::mutex> lock(mMutex);
        --mRunning;
        mChanged.notify_all();
    }

    // Takes the next frame and reads its stream picture. False when no frame is left, the
    // stream ended or a failure stopped the run.
    bool Take(Worker* worker, int* frame) {
        // Held while reading: frame numbers and stream pictures go out in the same order.
        std::lock_guard<std::mutex> reading(mReadMutex);
        {
            std::lock_guard<std::mutex> lock(mMutex);
            if (mFailed || mEnded || (!mOpenEnded && mNext > mRange.last)) return false;
            *frame = mNext++;
        }
        if (mJob.stream < 0) return true;
        std::string error;
        const RawReadResult read =
            ReadRawFrame(mJob.settings->rawIn, worker->Picture(mJob.stream), &error);
        if (read == RawReadResult::kFrame) return true;
        std::lock_guard<std::mutex> lock(mMutex);
        if (read == RawReadResult::kError) {
            Fail(*frame, "standard input, frame " + std::to_string(*frame) + ": " + error);
        } else if (mOpenEnded) {
            mEnded = true;
        } else {
            Fail(*frame, "standard input ended before frame " + std::to_string(*frame) +
                             " (--frames asks for " + std::to_string(mRange.first) + "-" +
                             std::to_string(mRange.last) + ")");
        }
        mChanged.notify_all();
        return false;
    }

    // Writes frame's result (null: rendering failed with error) and records the outcome.
    void Complete(int frame, const Frame* result, std::string error) {
        bool ok = result != nullptr;
        if (ok && !mJob.rawOut)
            ok = WriteImage(SequenceFramePath(mJob.settings->output, frame), *result, &error);
        std::unique_lock<std::mutex> lock(mMutex);
        if (ok && mJob.rawOut) {
            mChanged.wait(lock,
                          [&] { return mNextWrite == frame || (mFailed && mFailedFrame < frame); });
            if (mNextWrite != frame) return;  // an earlier frame failed: this one is dropped
            // The stream is this thread's alone until mNextWrite moves on.
            lock.unlock();
            ok = WriteRawFrame(mJob.settings->rawOut, *result, &error);
            if (!ok) error = "standard output: " + error;
            lock.lock();
            if (ok) ++mNextWrite;
        }
        if (ok)
            ++mDone;
        else
            Fail(frame, error);
        mChanged.notify_all();  // the next frame's writer and the progress wait for this
    }

    // Records a failure at frame; of several, the earliest frame's is kept, as one thread
    // would report it. Call with mMutex held.
    void Fail(int frame, const std::string& error) {
        if (!mFailed || frame < mFailedFrame) {
            mFailed = true;
            mFailedFrame = frame;
            mError = error;
        }
    }

    const Job& mJob;
    const FrameRange mRange;
    const bool mOpenEnded;
    std::mutex mReadMutex;
    std::mutex mMutex;  // guards everything below
    std::condition_variable mChanged;
    int mNext;       // the next frame to take
    int mNextWrite;  // the next frame to write to the raw output
    bool mEnded = false;
    size_t mRunning = 0;
    long long mDone = 0;
    bool mFailed = false;
    int mFailedFrame = 0;
    std::string mError;
};

// ---------------------------------------------------------------- set-up

// Opens the worker's effect and sets its render context and parameters.
bool SetUpEffect(const RenderSettings& settings, int modelIndex, int totalFrames, Worker* worker,
                 std::string* error) {
    if (!worker->effect.Open(settings.plugin, modelIndex, error)) return false;
    ulkHostInstance* instance = worker->effect.Instance();
    instance->SetTotalFrames(totalFrames);
    instance->SetFrameRate(settings.rate);
    instance->SetVideoType(settings.videoType);
    instance->SetFieldMode(settings.fieldMode);
    instance->SetFieldDominance(settings.fieldDominance);
    instance->SetField(settings.fieldDominance);
    instance->SetPixelAspect(settings.pixelAspect);
    instance->SetQuality(settings.quality);
    return ApplyParameterSettings(instance, settings.parameters, error);
}

// Gives the worker's instance its input and output images.
bool SetUpImages(const Job& job, ulkImgFormat order, Worker* worker, std::string* error) {
    ulkHostInstance* instance = worker->effect.Instance();
    worker->scratch.resize(job.sources.size());
    for (size_t i = 0; i < job.sources.size(); ++i) {
        worker->inputs.push_back(std::make_unique<EffectImage>());
        EffectImage& input = *worker->inputs[i];
        // Patterns and stream pictures are made in place; a scratch picture is needed only to
        // convert them to another order (sequence files bring their own).
        const SourceKind kind = job.sources[i].kind;
        const bool scratch = (kind == SourceKind::kPattern || kind == SourceKind::kStream) &&
                             order != kImgFormatRGBA;
        if (!input.Make(order, job.width, job.height) ||
            (scratch && !worker->scratch[i].Allocate(job.width, job.height)) ||
            !instance->SetInput(static_cast<int>(i), input.Image())) {
            *error = "cannot set up input " + std::to_string(i + 1) + " (out of memory?)";
            return false;
        }
    }
    if (!worker->output.Make(order, job.width, job.height) ||
        !instance->SetOutput(0, worker->output.Image())) {
        *error = "cannot set up the output (out of memory?)";
        return false;
    }
    return true;
}

bool CheckInputCount(const Effect& effect, size_t given, std::string* error) {
    const ulkHostModel* model = effect.Model();
    const int required = model->GetRequiredInputs();
    const int all = model->GetNumInputs();
    if (static_cast<int>(given) >= required && static_cast<int>(given) <= all) {
        if (model->GetNumOutputs() >= 1) return true;
        *error = effect.Name() + " has no output";
        return false;
    }
    std::string names;
    for (int i = 0; i < all; ++i) {
        const ulkObjectInfo* input = model->GetInputInfo(i);
        names += std::string(i ? ", " : "") + (input->GetName() ? input->GetName() : "?") +
                 (input->IsOptional() ? " (optional)" : "");
    }
    *error = effect.Name() + " takes " +
             (required == all ? std::to_string(all)
                              : std::to_string(required) + " to " + std::to_string(all)) +
             " input" + (all == 1 ? "" : "s") + (names.empty() ? "" : " (" + names + ")") + "; " +
             std::to_string(given) + " given";
    return false;
}

// Reads the sizes of the inputs (and the stills) and settles the frame size.
bool SettleSize(const RenderSettings& settings, int firstFrame, Job* job, std::string* error) {
    int width = 0, height = 0;
    std::string sizedBy;
    for (Source& source : job->sources) {
        if (source.kind == SourceKind::kStill && !ReadImage(source.name, &source.still, error))
            return false;
        if (source.kind == SourceKind::kStill) {
            source.width = source.still.Width();
            source.height = source.still.Height();
        } else if (source.kind == SourceKind::kSequence) {
            Frame first;
            if (!ReadImage(SequenceFramePath(source.sequence, firstFrame), &first, error))
                return false;
            source.width = first.Width();
            source.height = first.Height();
        }
        if (source.width == 0) continue;  // a pattern without a size of its own
        if (width == 0) {
            width = source.width;
            height = source.height;
            sizedBy = source.name;
        } else if (source.width != width || source.height != height) {
            *error = "input '" + source.name + "' is " + SizeText(source.width, source.height) +
                     " but '" + sizedBy + "' is " + SizeText(width, height) +
                     " (inputs must all have one size)";
            return false;
        }
    }
    if (width == 0 && settings.hasSize) {
        width = settings.width;
        height = settings.height;
    } else if (width == 0 && settings.raw) {
        width = settings.rawWidth;
        height = settings.rawHeight;
    } else if (width == 0 && !job->sources.empty()) {
        width = kDefaultWidth;
        height = kDefaultHeight;
    } else if (width == 0) {
        *error = "the effect has no image input: give the frame size with --size WxH";
        return false;
    }
    if (IsStream(settings.output) && settings.raw &&
        (width != settings.rawWidth || height != settings.rawHeight)) {
        *error = "the frames are " + SizeText(width, height) + " but --raw says " +
                 SizeText(settings.rawWidth, settings.rawHeight);
        return false;
    }
    job->width = width;
    job->height = height;
    return true;
}

}  // namespace

bool Render(const RenderSettings& settings, const std::function<void(const std::string&)>& notice,
            RenderSummary* summary, std::string* error) {
    Job job;
    job.settings = &settings;
    size_t streams = 0;
    for (const std::string& input : settings.inputs) {
        job.sources.emplace_back();
        if (!ParseSource(input, settings, &job.sources.back(), error)) return false;
        if (job.sources.back().kind != SourceKind::kStream) continue;
        job.stream = static_cast<int>(job.sources.size()) - 1;
        ++streams;
    }
    if (streams > 1) {
        *error = "only one input can be '-' (standard input)";
        return false;
    }
    const bool rawOut = IsStream(settings.output);
    job.rawOut = rawOut;

    // The frames: as asked, else the first sequence's files, else frame 0 (or, for a stream,
    // frames from 0 until it ends).
    FrameRange range;
    bool openEnded = false;
    if (settings.hasFrames) {
        range = settings.frames;
    } else {
        const auto sequence =
            std::find_if(job.sources.begin(), job.sources.end(),
                         [](const Source& s) { return s.kind == SourceKind::kSequence; });
        if (sequence != job.sources.end()) {
            const std::vector<int> found = ListSequenceFrames(sequence->sequence);
            if (found.empty()) {
                *error = "input '" + sequence->name + "': no files match it";
                return false;
            }
            range = {found.front(), found.back()};
        }
        openEnded = streams > 0;
    }
    if (!rawOut && !openEnded && range.Count() > 1 && !IsSequencePattern(settings.output)) {
        *error = "output '" + settings.output + "' has no frame number (as name.####.png) but " +
                 std::to_string(range.Count()) + " frames are rendered";
        return false;
    }
    if (!rawOut && !openEnded && !IsSequencePattern(settings.output) &&
        !CanWriteImage(settings.output)) {
        *error = "output '" + settings.output + "': no image format for this file name";
        return false;
    }
    if (!rawOut && IsSequencePattern(settings.output)) {
        SequencePattern pattern;
        if (!ParseSequencePattern(settings.output, &pattern, error)) {
            *error = "output '" + settings.output + "': " + *error;
            return false;
        }
        if (!CanWriteImage(SequenceFramePath(pattern, range.first))) {
            *error = "output '" + settings.output + "': no image format for this file name";
            return false;
        }
    }
    if (openEnded && !rawOut && !IsSequencePattern(settings.output)) {
        *error = "output '" + settings.output +
                 "' has no frame number (as name.####.png) but the input is a stream";
        return false;
    }
    const int totalFrames = settings.totalFrames > 0 ? settings.totalFrames
                            : openEnded              ? 1
                                                     : range.last + 1;

    // Every model and instance is made here, before any worker runs; they share one start-up
    // of the module.
    LoadedModule module;
    if (!module.Load(settings.plugin, error)) return false;
    const int modelIndex = FindModel(settings.plugin, settings.model, error);
    if (modelIndex < 0) return false;
    const long long known = openEnded ? 0 : range.Count();
    const long long wanted =
        openEnded ? settings.threads : std::min<long long>(settings.threads, known);
    std::vector<std::unique_ptr<Worker>> workers;
    for (long long i = 0; i < std::max<long long>(1, wanted); ++i) {
        workers.push_back(std::make_unique<Worker>());
        if (!SetUpEffect(settings, modelIndex, totalFrames, workers.back().get(), error))
            return false;
        if (i == 0 && !CheckInputCount(workers[0]->effect, job.sources.size(), error)) return false;
    }
    if (!SettleSize(settings, range.first, &job, error)) return false;
    ulkImgFormat order = kImgFormatAny;
    std::string note;
    if (!ChooseOrder(workers[0]->effect, &order, &note, error)) return false;
    for (auto& worker : workers)
        if (!SetUpImages(job, order, worker.get(), error)) return false;
    if (!note.empty()) notice(note);
    if (!settings.saveKeys.empty() &&
        !WriteKeyFile(settings.saveKeys, CollectKeys(workers[0]->effect.Instance()), error))
        return false;

    ProgressBar bar(known, settings.quiet || openEnded);
    const auto start = std::chrono::steady_clock::now();
    Schedule schedule(job, range, openEnded);
    if (!schedule.Run(workers, &bar, error)) return false;
    bar.Finish();
    summary->frames = schedule.Done();
    summary->seconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    return true;
}

}  // namespace ulk_tools
