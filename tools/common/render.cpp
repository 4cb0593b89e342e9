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

// An image in the effect's pixel format with pixels of its own.
class EffectImage {
  public:
    EffectImage() = default;
    EffectImage(const EffectImage&) = delete;
    EffectImage& operator=(const EffectImage&) = delete;
    ~EffectImage() {
        if (mBuffer) mImage->FreeBuffer(mBuffer);
    }

    bool Make(ulkImgFormat order, int width, int height) {
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

  private:
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
    std::vector<Frame> scratch;  // RGBA pictures read for the current frame
    Frame result;
};

// The job as the workers see it: read-only while they run.
struct Job {
    const RenderSettings* settings = nullptr;
    std::vector<Source> sources;
    int width = 0, height = 0;
    bool writeFiles = true;  // false: results are kept for the raw output stream
};

// Renders one frame with worker; stream pictures come in streamed (one per stream input).
bool RenderFrame(const Job& job, Worker* worker, int frame, const std::vector<Frame>& streamed,
                 std::string* error) {
    size_t next = 0;
    for (size_t i = 0; i < job.sources.size(); ++i) {
        const Source& source = job.sources[i];
        const Frame* picture = &worker->scratch[i];
        switch (source.kind) {
            case SourceKind::kStill:
                picture = &source.still;
                break;
            case SourceKind::kStream:
                picture = &streamed[next++];
                break;
            case SourceKind::kPattern:
                FillTestPattern(&worker->scratch[i], frame);
                break;
            case SourceKind::kSequence:
                if (!ReadSized(SequenceFramePath(source.sequence, frame), job.width, job.height,
                               &worker->scratch[i], error))
                    return false;
                break;
        }
        if (!CopyFrameToImage(*picture, worker->inputs[i]->Image(), error)) {
            *error = "frame " + std::to_string(frame) + ": " + *error;
            return false;
        }
    }
    ulkHostInstance* instance = worker->effect.Instance();
    instance->SetCurrentFrame(frame);
    const ulkBounds bounds = {0, 0, job.width - 1, job.height - 1};
    if (!instance->Execute(&bounds)) {
        *error = "frame " + std::to_string(frame) + ": " + worker->effect.Name() +
                 " failed: " + instance->GetErrorString();
        return false;
    }
    // An in-place effect with nothing to do leaves the picture to the host: its input is
    // the output then.
    if (!job.sources.empty() && !instance->HasEffect() && instance->InPlace() &&
        !worker->output.Image()->Copy(worker->inputs[0]->Image(), nullptr)) {
        *error = "frame " + std::to_string(frame) + ": cannot pass the input through";
        return false;
    }
    if (!CopyImageToFrame(*worker->output.Image(), &worker->result, error)) {
        *error = "frame " + std::to_string(frame) + ": " + *error;
        return false;
    }
    if (!job.writeFiles) return true;
    return WriteImage(SequenceFramePath(job.settings->output, frame), worker->result, error);
}

// Frames handed out to the workers, and the first failure.
class Schedule {
  public:
    Schedule(const std::vector<int>& frames, const std::vector<std::vector<Frame>>* streamed,
             std::vector<Frame>* results)
        : mFrames(frames), mStreamed(streamed), mResults(results) {}

    void Work(const Job& job, Worker* worker) {
        static const std::vector<Frame> kNone;
        for (;;) {
            size_t index;
            {
                std::lock_guard<std::mutex> lock(mMutex);
                if (mFailed || mNext == mFrames.size()) return;
                index = mNext++;
            }
            std::string error;
            const bool ok = RenderFrame(job, worker, mFrames[index],
                                        mStreamed ? (*mStreamed)[index] : kNone, &error);
            if (ok && mResults) (*mResults)[index] = worker->result;
            std::lock_guard<std::mutex> lock(mMutex);
            if (ok) {
                ++mDone;
            } else if (!mFailed || mFrames[index] < mFailedFrame) {
                // Of several failures the earliest frame's is reported, as one thread would.
                mFailed = true;
                mFailedFrame = mFrames[index];
                mError = error;
            }
            mChanged.notify_all();
        }
    }

    // Runs the frames on the workers; progress is drawn on this thread.
    bool Run(const Job& job, std::vector<std::unique_ptr<Worker>>& workers, ProgressBar* bar,
             long long doneBefore, std::string* error) {
        const size_t count = std::min(workers.size(), mFrames.size());
        std::vector<std::thread> threads;
        for (size_t i = 1; i < count; ++i)
            threads.emplace_back([this, &job, &workers, i] { Work(job, workers[i].get()); });
        if (threads.empty()) {
            Work(job, workers[0].get());
            bar->Update(doneBefore + static_cast<long long>(mDone));
        } else {
            // The calling thread only watches, so every worker keeps its own instance.
            std::unique_lock<std::mutex> lock(mMutex);
            while (!mFailed && mDone < mFrames.size()) {
                mChanged.wait_for(lock, std::chrono::milliseconds(100));
                bar->Update(doneBefore + static_cast<long long>(mDone));
            }
            lock.unlock();
            for (std::thread& thread : threads) thread.join();
        }
        if (mFailed) *error = mError;
        return !mFailed;
    }

  private:
    const std::vector<int>& mFrames;
    const std::vector<std::vector<Frame>>* mStreamed;
    std::vector<Frame>* mResults;
    std::mutex mMutex;
    std::condition_variable mChanged;
    size_t mNext = 0;
    size_t mDone = 0;
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
    for (size_t i = 0; i < job.sources.size(); ++i)
        worker->inputs.push_back(std::make_unique<EffectImage>());
    worker->scratch.resize(job.sources.size());
    for (size_t i = 0; i < job.sources.size(); ++i) {
        if (!worker->inputs[i]->Make(order, job.width, job.height) ||
            !worker->scratch[i].Allocate(job.width, job.height) ||
            !instance->SetInput(static_cast<int>(i), worker->inputs[i]->Image())) {
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
        streams += job.sources.back().kind == SourceKind::kStream;
    }
    if (streams > 1) {
        *error = "only one input can be '-' (standard input)";
        return false;
    }
    const bool rawOut = IsStream(settings.output);
    job.writeFiles = !rawOut;

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
    long long done = 0;
    if (streams == 0 && !rawOut) {
        std::vector<int> frames;
        for (int f = range.first; f <= range.last; ++f) frames.push_back(f);
        Schedule schedule(frames, nullptr, nullptr);
        if (!schedule.Run(job, workers, &bar, 0, error)) return false;
        done = range.Count();
    } else {
        // Streams keep frame order: read a batch, render it, write it, in turn.
        const size_t batch = workers.size() * 2;
        int frame = range.first;
        for (;;) {
            std::vector<int> frames;
            std::vector<std::vector<Frame>> streamed;
            while (frames.size() < batch && (openEnded || frame <= range.last)) {
                std::vector<Frame> pictures;
                if (streams) {
                    pictures.emplace_back();
                    if (!pictures[0].Allocate(job.width, job.height)) {
                        *error = "out of memory";
                        return false;
                    }
                    const RawReadResult read = ReadRawFrame(settings.rawIn, &pictures[0], error);
                    if (read == RawReadResult::kError) {
                        *error = "standard input, frame " + std::to_string(frame) + ": " + *error;
                        return false;
                    }
                    if (read == RawReadResult::kEnd) {
                        if (openEnded) break;
                        *error = "standard input ended before frame " + std::to_string(frame) +
                                 " (--frames asks for " + std::to_string(range.first) + "-" +
                                 std::to_string(range.last) + ")";
                        return false;
                    }
                }
                frames.push_back(frame++);
                streamed.push_back(std::move(pictures));
            }
            if (frames.empty()) break;
            std::vector<Frame> results(rawOut ? frames.size() : 0);
            Schedule schedule(frames, &streamed, rawOut ? &results : nullptr);
            if (!schedule.Run(job, workers, &bar, done, error)) return false;
            for (const Frame& result : results)
                if (!WriteRawFrame(settings.rawOut, result, error)) {
                    *error = "standard output: " + *error;
                    return false;
                }
            done += static_cast<long long>(frames.size());
            if (frames.size() < batch) break;
        }
    }
    bar.Finish();
    summary->frames = done;
    summary->seconds =
        std::chrono::duration<double>(std::chrono::steady_clock::now() - start).count();
    return true;
}

}  // namespace ulk_tools
