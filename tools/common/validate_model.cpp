// The checks of one model, run inside the child process ulk-validate starts for it.
#include <dlfcn.h>

#include <cmath>
#include <cstdlib>
#include <cstring>
#include <exception>
#include <memory>
#include <set>
#include <string>
#include <utility>
#include <vector>

#include "ulk/ulk.h"
#include "ulk_tools/effect.h"
#include "ulk_tools/validate.h"
#include "ulk_tools/validate_image.h"

namespace ulk_tools {

namespace {

// ------------------------------------------------------------------ host memory accounting

// The per-class callbacks count the blocks they hand out, so that what a plug-in never gives
// back shows at the end of the model's life.
enum MemoryClass { kModelMemory, kInstanceMemory, kOverlayMemory, kMemoryClasses };
const char* const kMemoryClassNames[kMemoryClasses] = {"model", "instance", "overlay"};

struct BlockCount {
    long long blocks = 0;
    long long bytes = 0;
};
BlockCount gLive[kMemoryClasses];

// A header in front of each block keeps its size; 16 bytes keep the block aligned.
constexpr size_t kBlockHeader = 16;

template <int kClass>
void* CountedAlloc(size_t size) {
    auto* block = static_cast<unsigned char*>(std::malloc(size + kBlockHeader));
    if (!block) return nullptr;
    std::memcpy(block, &size, sizeof size);
    ++gLive[kClass].blocks;
    gLive[kClass].bytes += static_cast<long long>(size);
    return block + kBlockHeader;
}

template <int kClass>
void CountedFree(void* p) {
    if (!p) return;
    unsigned char* block = static_cast<unsigned char*>(p) - kBlockHeader;
    size_t size = 0;
    std::memcpy(&size, block, sizeof size);
    --gLive[kClass].blocks;
    gLive[kClass].bytes -= static_cast<long long>(size);
    std::free(block);
}

void InstallCountingAllocators() {
    ulkHostModel::SetAllocCallback(CountedAlloc<kModelMemory>);
    ulkHostModel::SetFreeCallback(CountedFree<kModelMemory>);
    ulkHostInstance::SetAllocCallback(CountedAlloc<kInstanceMemory>);
    ulkHostInstance::SetFreeCallback(CountedFree<kInstanceMemory>);
    ulkHostOverlay::SetAllocCallback(CountedAlloc<kOverlayMemory>);
    ulkHostOverlay::SetFreeCallback(CountedFree<kOverlayMemory>);
}

// ------------------------------------------------------------------ helpers

std::string Text(const char* text) {
    return text ? text : "";
}

std::string Join(const std::vector<std::string>& parts, const char* separator) {
    std::string all;
    for (const std::string& part : parts) all += (all.empty() ? "" : separator) + part;
    return all;
}

// Runs call; an exception of any type becomes a message in thrown and a false answer.
template <class Call>
bool NoThrow(Call call, std::string* thrown) {
    try {
        call();
        return true;
    } catch (const std::exception& e) {
        *thrown = std::string("threw: ") + e.what();
    } catch (const char* text) {
        *thrown = std::string("threw: ") + Text(text);
    } catch (...) {
        *thrown = "threw an exception of unknown type";
    }
    return false;
}

// The first place a kind of fault was seen, and how often.
struct Finding {
    int count = 0;
    std::string first;

    void Add(const std::string& where) {
        if (count++ == 0) first = where;
    }
    std::string Text() const {
        return count > 1 ? first + " (and " + std::to_string(count - 1) + " more)" : first;
    }
};

// A pixel format the validator can fill: interleaved RGB family, 8 or 16 bits.
struct TriedFormat {
    ulkImgFormat code;
    int bitDepth;
    std::string Name() const { return ImageFormatText(code) + "/" + std::to_string(bitDepth); }
    bool operator==(const TriedFormat& o) const { return code == o.code && bitDepth == o.bitDepth; }
};

bool IsRGBFamily(int32_t code) {
    return code >= kImgFormatRGB && code <= kImgFormatBGRA;
}

// When in a clip a frame is rendered: three progressive times, then both fields of the middle
// frame of interlaced video. The clip has 101 frames, so frames 0, 50 and 100 are the times
// 0, 0.5 and 1.
struct Timing {
    const char* label;
    bool interlaced;
    int frame;
    ulkField field;
};
const Timing kTimings[] = {{"t=0", false, 0, kFieldOne},
                           {"t=0.5", false, 50, kFieldOne},
                           {"t=1", false, 100, kFieldOne},
                           {"field 1", true, 50, kFieldOne},
                           {"field 2", true, 50, kFieldTwo}};
const Timing& kMiddle = kTimings[1];
constexpr int kClipFrames = 101;

void ApplyTiming(ulkHostInstance* instance, const Timing& timing) {
    instance->SetFrameRate(25.0);
    instance->SetTotalFrames(kClipFrames);
    instance->SetCurrentFrame(timing.frame);
    instance->SetVideoType(timing.interlaced ? kVideoTypeInterlaced : kVideoTypeProgressive);
    instance->SetFieldMode(timing.interlaced ? kFieldModeFields : kFieldModeFrames);
    instance->SetNumFields(timing.interlaced ? 2 : 1);
    instance->SetFieldDominance(kFieldOne);
    instance->SetFieldTopness(kFieldOne);
    instance->SetField(timing.field);
}

struct FrameSize {
    int width, height;
};

// A drawing surface with guard bytes around and between its rows.
class GuardedSurface : public ulkBaseOverlayContext {
  public:
    static constexpr short kWidth = 64, kHeight = 48;
    GuardedSurface() : mBuffer(kWidth * 4, kWidth * 4 + 32, kHeight, 99) {}

    unsigned char* GetBuffer() override { return mBuffer.Pixels(); }
    void* GetNativeWindow() override { return &mWindowToken; }
    void GetVidRect(ulkBounds& rect) override { rect = {8, 6, kWidth - 9, kHeight - 7}; }
    short GetWidth() override { return kWidth; }
    short GetHeight() override { return kHeight; }
    short GetRowDelta() override { return static_cast<short>(mBuffer.RowDelta()); }

    GuardedBuffer& Buffer() { return mBuffer; }

  private:
    GuardedBuffer mBuffer;
    int mWindowToken = 0;
};

// ------------------------------------------------------------------ the model's life

class ModelRun {
  public:
    ModelRun(const std::string& path, int index, const ValidateOptions& options,
             const ValidationSink& sink)
        : mPath(path), mIndex(index), mOptions(options), mSink(sink) {}

    void Run();

  private:
    void Report(bool passed, const std::string& name, const std::string& detail) {
        if (mSink.check) mSink.check(CheckLine{passed, name, detail});
    }
    void Step(const std::string& name, const std::string& where = std::string()) {
        if (mSink.step) mSink.step(name, where);
    }
    void ReportFinding(const std::string& name, const Finding& finding,
                       const std::string& passDetail) {
        Report(finding.count == 0, name, finding.count == 0 ? passDetail : finding.Text());
    }

    bool Open();
    void CheckIdentity();
    void CheckDescription();
    void CheckParameters();
    void CheckPrePostProcess();
    void CheckExecute();
    void CheckOverlay();
    void CheckCleanUp();
    void CheckMemory();

    void SetMedia(const TriedFormat& format, FrameSize size);
    void ExecuteOnce(const std::string& where);
    void VaryParameters();

    std::string mPath;
    int mIndex;
    ValidateOptions mOptions;
    ValidationSink mSink;
    std::unique_ptr<ulkHostModel> mModel;
    ulkHostInstance* mInstance = nullptr;
    std::vector<TriedFormat> mFormats;
    std::vector<std::unique_ptr<GuardedImage>> mInputs, mOutputs;
    std::vector<std::vector<uint8_t>> mInputBytes;  // the inputs as they were set
    Finding mExecuteFaults, mBoundsFaults, mInputFaults, mExceptions;
};

void ModelRun::Run() {
    InstallHostServices(2);
    InstallCountingAllocators();
    mModel = std::make_unique<ulkHostModel>(static_cast<short>(mIndex));
    if (Open()) {
        CheckIdentity();
        CheckDescription();
        Step("instance");
        std::string thrown;
        mInstance = NewInstanceOf(mModel.get(), &thrown);
        Report(mInstance != nullptr, "instance",
               mInstance
                   ? "made one, " + std::to_string(mInstance->GetNumParameters()) + " parameters"
                   : (thrown.empty() ? InstanceErrorText(*mModel) : thrown));
        if (mInstance) {
            CheckParameters();
            CheckPrePostProcess();
            CheckExecute();
            ReportFinding("exceptions", mExceptions, "none left the plug-in");
            CheckOverlay();
            CheckCleanUp();
        }
        Step("close");
        std::string thrown2;
        if (!NoThrow([&] { mModel->Close(); }, &thrown2))
            Report(false, "close", "closing the model " + thrown2);
    }
    mModel.reset();  // releases the model's copy of the path
    CheckMemory();
}

bool ModelRun::Open() {
    Step("open");
    dlerror();
    bool opened = false;
    std::string thrown;
    if (!NoThrow([&] { opened = mModel->Open(mPath.c_str(), 0, nullptr); }, &thrown)) {
        Report(false, "open", "opening the model " + thrown);
        return false;
    }
    if (!opened) {
        Report(false, "open", ModelErrorText(*mModel));
        return false;
    }
    if (mSink.identity) mSink.identity(Text(mModel->GetName()), Text(mModel->GetIdentifier()));
    Report(true, "open", "opened model " + std::to_string(mIndex));
    return true;
}

void ModelRun::CheckIdentity() {
    std::vector<std::string> problems;
    const std::string name = Text(mModel->GetName());
    if (name.empty()) problems.push_back("no name");
    const char* type = ulkHostModel::GetTypeName(mModel->GetType());
    if (!type)
        problems.push_back("type " + std::to_string(static_cast<int32_t>(mModel->GetType())) +
                           " is not Filter, Compositor or Title");
    if (!ulkHostModel::GetClassName(mModel->GetClass()))
        problems.push_back("class " + std::to_string(static_cast<int32_t>(mModel->GetClass())) +
                           " is not Image");
    const std::string identifier = Text(mModel->GetIdentifier());
    Report(problems.empty(), "identity",
           problems.empty()
               ? name + ", " + type + (identifier.empty() ? ", no identifier" : ", " + identifier)
               : Join(problems, "; "));
}

void ModelRun::CheckDescription() {
    std::vector<std::string> problems, accepted, untried;
    for (int i = 0; i < mModel->GetNumFormats(); ++i) {
        const ulkImageFormat* format = mModel->GetFormat(i);
        const int depth = format->GetBitDepth() == 0 ? 8 : format->GetBitDepth();
        accepted.push_back(ImageFormatText(format->GetFormat()) + "/" + std::to_string(depth));
        std::vector<ulkImgFormat> codes;
        if (format->GetFormat() == kImgFormatAny)
            codes = {kImgFormatRGBA, kImgFormatBGRA, kImgFormatARGB};
        else if (IsRGBFamily(format->GetFormat()))
            codes = {format->GetFormat()};
        if (codes.empty() || (depth != 8 && depth != 16)) {
            untried.push_back(accepted.back());
            continue;
        }
        for (ulkImgFormat code : codes) {
            const TriedFormat tried{code, depth};
            bool known = false;
            for (const TriedFormat& f : mFormats) known = known || f == tried;
            if (!known) mFormats.push_back(tried);
        }
    }
    if (accepted.empty()) problems.push_back("no pixel format");

    const ulkPluginType type = mModel->GetType();
    const int required = mModel->GetRequiredInputs();
    if (type == kPluginTypeFilter && required < 1)
        problems.push_back("a filter with no required input");
    if (type == kPluginTypeCompositor && required < 2)
        problems.push_back("a compositor with " + std::to_string(required) + " required inputs");
    if (type == kPluginTypeTitle && required != 0)
        problems.push_back("a title with " + std::to_string(required) + " required inputs");
    if (mModel->GetNumOutputs() < 1) problems.push_back("no output");

    // Hosts connect inputs and outputs by identifier.
    auto checkPorts = [&](int count, const ulkObjectInfo* (ulkHostModel::*get)(int) const,
                          const char* what) {
        std::set<std::string> ids;
        for (int i = 0; i < count; ++i) {
            const ulkObjectInfo* port = (mModel.get()->*get)(i);
            const std::string id = port ? Text(port->GetID()) : "";
            const std::string label = std::string(what) + " " + std::to_string(i);
            if (!port || Text(port->GetName()).empty()) problems.push_back(label + " has no name");
            if (id.empty())
                problems.push_back(label + " has no identifier");
            else if (!ids.insert(id).second)
                problems.push_back(label + " repeats the identifier '" + id + "'");
        }
    };
    checkPorts(mModel->GetNumInputs(), &ulkHostModel::GetInputInfo, "input");
    checkPorts(mModel->GetNumOutputs(), &ulkHostModel::GetOutputInfo, "output");

    std::string detail = "formats " + Join(accepted, ", ") +
                         "; inputs: " + std::to_string(mModel->GetNumInputs()) + " (" +
                         std::to_string(required) +
                         " required), outputs: " + std::to_string(mModel->GetNumOutputs());
    if (!untried.empty()) detail += "; not exercised: " + Join(untried, ", ");
    Report(problems.empty(), "description", problems.empty() ? detail : Join(problems, "; "));
}

void ModelRun::CheckParameters() {
    Step("parameters");
    std::vector<std::string> problems;
    std::set<std::string> ids;
    const int count = mInstance->GetNumParameters();
    for (int i = 0; i < count; ++i) {
        ulkParameter* p = mInstance->GetParameter(i);
        const std::string id = Text(p->GetID());
        const std::string label =
            "parameter " + std::to_string(i) + (id.empty() ? std::string() : " '" + id + "'");
        if (Text(p->GetLabel()).empty()) problems.push_back(label + " has no label");
        if (id.empty())
            problems.push_back(label + " has no identifier");
        else if (!ids.insert(id).second)
            problems.push_back(label + ": the identifier is used twice");
        if (p->IsGroup()) continue;
        if (p->GetNumKeys() < 1) {
            problems.push_back(label + " has no value");
            continue;
        }
        if (p->IsNumber()) {
            auto* number = static_cast<ulkPNumber*>(p);
            const double lo = number->GetMinimum(), hi = number->GetMaximum();
            const double value = number->GetValue(0.0);
            if (!std::isfinite(lo) || !std::isfinite(hi) || lo > hi)
                problems.push_back(label + ": the range is not a range");
            else if (!(value >= lo && value <= hi))
                problems.push_back(label + ": the default lies outside the range");
        } else if (p->IsList()) {
            auto* list = static_cast<ulkPList*>(p);
            const int items = list->GetNumItems();
            bool named = items > 0;
            for (int item = 0; item < items; ++item)
                named = named && !Text(list->GetListItem(item)).empty();
            const int value = list->GetValue(0.0);
            if (!named)
                problems.push_back(label + ": an item without text, or no items");
            else if (value < 0 || value >= items)
                problems.push_back(label + ": the default names no item");
        } else if (p->IsString()) {
            const size_t size = p->GetValueSize();
            std::vector<char> text(size + 1, 1);
            if (size < 1 || size > 256)
                problems.push_back(label + ": a text size outside 1 to 256");
            else if (!static_cast<ulkPString*>(p)->GetValue(0.0, text.data(), size) ||
                     text[size - 1] != '\0')
                problems.push_back(label + ": the default text is not terminated inside its size");
        }
        // What a host saves must read back.
        ulkMemoryFile file;
        if (!p->WriteValue(0.0, &file) || !p->ParseValue(0.0, file.GetText()))
            problems.push_back(label + ": its text form does not read back");
    }
    if (problems.size() > 3) problems.resize(3);
    Report(
        problems.empty(), "parameters",
        problems.empty() ? "all " + std::to_string(count) + " well formed" : Join(problems, "; "));
}

void ModelRun::SetMedia(const TriedFormat& format, FrameSize size) {
    mInputs.clear();
    mOutputs.clear();
    mInputBytes.clear();
    for (int i = 0; i < mModel->GetNumInputs(); ++i) {
        mInputs.push_back(std::make_unique<GuardedImage>(format.code, format.bitDepth, size.width,
                                                         size.height, 17 + i));
        mInputBytes.push_back(mInputs.back()->Buffer().Bytes());
        mInstance->SetInput(i, mInputs.back()->Image());
    }
    for (int i = 0; i < mModel->GetNumOutputs(); ++i) {
        mOutputs.push_back(std::make_unique<GuardedImage>(format.code, format.bitDepth, size.width,
                                                          size.height, 71 + i));
        mInstance->SetOutput(i, mOutputs.back()->Image());
    }
}

// Renders once into the media set and sorts what went wrong into the findings; damage is
// repaired so that the next frame is judged on its own.
void ModelRun::ExecuteOnce(const std::string& where) {
    Step("execute", where);
    bool done = false;
    std::string thrown;
    if (!NoThrow([&] { done = mInstance->Execute(nullptr); }, &thrown))
        mExceptions.Add(where + ": HasEffect, InPlace, PreProcess or PostProcess " + thrown);
    else if (!done && mInstance->GetError() == kErrorUnhandledException)
        mExceptions.Add(where + ": Execute threw (" + Text(mInstance->GetErrorString()) + ")");
    else if (!done)
        mExecuteFaults.Add(where + ": answered false: " + Text(mInstance->GetErrorString()));
    for (size_t i = 0; i < mOutputs.size(); ++i) {
        GuardedBuffer& buffer = mOutputs[i]->Buffer();
        const std::string damage = buffer.GuardDamage();
        if (damage.empty()) continue;
        mBoundsFaults.Add(where + ": output " + std::to_string(i) + ": wrote " + damage);
        buffer.RepairGuards();
    }
    for (size_t i = 0; i < mInputs.size(); ++i) {
        GuardedBuffer& buffer = mInputs[i]->Buffer();
        const std::string change = buffer.Difference(mInputBytes[i]);
        if (change.empty()) continue;
        mInputFaults.Add(where + ": input " + std::to_string(i) + " changed, " + change);
        buffer.Restore(mInputBytes[i]);
    }
}

void ModelRun::CheckPrePostProcess() {
    if (mFormats.empty()) return;
    SetMedia(mFormats.front(), {17, 9});
    const std::string where = mFormats.front().Name() + " 17x9";
    std::vector<std::string> problems;
    auto call = [&](const char* what, auto operation) {
        Step("pre/post-process", what);
        std::string thrown;
        if (!NoThrow(operation, &thrown)) problems.push_back(std::string(what) + " " + thrown);
    };
    // A run of frames the host brackets itself, then a frame the library brackets, then a run
    // ended by CleanUp: the plug-in must be able to prepare again after each end.
    for (int run = 0; run < 2; ++run) {
        call("PreProcess", [&] {
            if (!mInstance->PreProcess())
                problems.push_back("PreProcess answered false: " +
                                   Text(mInstance->GetErrorString()));
        });
        for (const Timing& timing : {kTimings[0], kTimings[1]}) {
            ApplyTiming(mInstance, timing);
            ExecuteOnce(where + " " + timing.label + " inside PreProcess/PostProcess");
        }
        if (run == 0) {
            call("PostProcess", [&] { mInstance->PostProcess(); });
            ApplyTiming(mInstance, kMiddle);
            ExecuteOnce(where + " t=0.5 after PostProcess");
        } else {
            call("CleanUp", [&] { mInstance->CleanUp(); });
        }
    }
    Report(problems.empty(), "pre/post-process",
           problems.empty() ? "two runs of frames prepared and ended" : Join(problems, "; "));
}

// Moves every number to three quarters of its range, flips every boolean and picks every
// list's last item, so that effects that do nothing at their defaults render something.
void ModelRun::VaryParameters() {
    for (int i = 0; i < mInstance->GetNumParameters(); ++i) {
        ulkParameter* p = mInstance->GetParameter(i);
        if (p->IsNumber()) {
            auto* number = static_cast<ulkPNumber*>(p);
            double value =
                number->GetMinimum() + 0.75 * (number->GetMaximum() - number->GetMinimum());
            if (number->GetType() == kPNumberInteger) value = std::floor(value);
            number->SetValue(0.0, value);
        } else if (p->IsBoolean()) {
            auto* flag = static_cast<ulkPBoolean*>(p);
            flag->SetValue(0.0, !flag->GetValue(0.0));
        } else if (p->IsList()) {
            auto* list = static_cast<ulkPList*>(p);
            if (list->GetNumItems() > 0) list->SetValue(0.0, list->GetNumItems() - 1);
        }
    }
}

void ModelRun::CheckExecute() {
    if (mFormats.empty()) {
        Report(true, "execute", "skipped: no 8- or 16-bit RGB-family format accepted");
        return;
    }
    std::vector<FrameSize> sizes = {{1, 1}, {17, 9}};
    if (!mOptions.quick) sizes.push_back({1920, 1080});
    int frames = 0;
    for (const char* setting : {"default", "varied"}) {
        if (std::strcmp(setting, "varied") == 0) {
            std::string thrown;
            if (!NoThrow([&] { VaryParameters(); }, &thrown))
                mExceptions.Add("setting varied parameters " + thrown);
        }
        for (const TriedFormat& format : mFormats) {
            for (FrameSize size : sizes) {
                SetMedia(format, size);
                // Large frames once per setting; small ones at every time and field.
                const bool large = size.width > 100;
                for (const Timing& timing : kTimings) {
                    if (large && &timing != &kMiddle) continue;
                    ApplyTiming(mInstance, timing);
                    ExecuteOnce(format.Name() + " " + std::to_string(size.width) + "x" +
                                std::to_string(size.height) + " " + timing.label + ", " + setting +
                                " parameters");
                    ++frames;
                }
            }
        }
    }
    std::vector<std::string> names;
    for (const TriedFormat& format : mFormats) names.push_back(format.Name());
    std::string sizeText;
    for (FrameSize size : sizes)
        sizeText += (sizeText.empty() ? "" : ", ") + std::to_string(size.width) + "x" +
                    std::to_string(size.height);
    ReportFinding("execute", mExecuteFaults,
                  std::to_string(frames) + " frames in " + Join(names, ", ") + " at " + sizeText +
                      "; t=0, 0.5, 1 and both fields; default and varied parameters");
    ReportFinding("output bounds", mBoundsFaults, "nothing written outside the output rows");
    if (mModel->GetNumInputs() > 0)
        ReportFinding("input unchanged", mInputFaults, "no input pixel or guard byte changed");
}

void ModelRun::CheckOverlay() {
    Step("overlay");
    ulkHostOverlay* overlay = nullptr;
    std::string thrown;
    if (!NoThrow([&] { overlay = mModel->NewOverlay(); }, &thrown)) {
        Report(false, "overlay", "the overlay factory " + thrown);
        return;
    }
    if (!overlay) return;  // the module offers none

    // Modes: each named, each selectable.
    std::vector<std::string> problems, names;
    const int modes = overlay->GetNumModes();
    for (int i = 0; i < modes; ++i) {
        char name[256] = {};
        overlay->GetModeName(i, name, sizeof name);
        names.push_back(name);
        if (name[0] == '\0') problems.push_back("mode " + std::to_string(i) + " has no name");
        std::string error;
        if (!NoThrow([&] { overlay->SetMode(i); }, &error))
            problems.push_back("selecting mode " + std::to_string(i) + " " + error);
        else if (overlay->GetMode() != i)
            problems.push_back("mode " + std::to_string(i) + " cannot be selected");
    }
    Report(problems.empty(), "overlay modes",
           problems.empty()
               ? std::to_string(modes) + " modes" + (names.empty() ? "" : ": " + Join(names, ", "))
               : Join(problems, "; "));

    GuardedSurface surface;
    {
        std::string error;
        NoThrow(
            [&] {
                overlay->SetInstance(mInstance);
                surface.SetOverlay(overlay);
            },
            &error);
        const bool bound = overlay->GetContext() == &surface && surface.GetOverlay() == overlay &&
                           overlay->GetInstance() == mInstance->GetPluginInstance();
        Report(bound && error.empty(), "overlay binding",
               !error.empty() ? "binding " + error
               : bound        ? "bound to a 64x48 surface and the instance"
                              : "the overlay and the surface do not name each other");
    }

    // A few events in every mode, as a user would give them.
    Finding faults;
    ApplyTiming(mInstance, kMiddle);
    const double x = GuardedSurface::kWidth / 2.0, y = GuardedSurface::kHeight / 2.0;
    for (int mode = 0; mode < (modes > 0 ? modes : 1); ++mode) {
        const std::string where = "mode " + std::to_string(mode) + ": ";
        auto event = [&](const char* what, auto call) {
            Step("overlay events", where + what);
            std::string error;
            if (!NoThrow(call, &error)) faults.Add(where + what + " " + error);
            const std::string damage = surface.Buffer().GuardDamage();
            if (damage.empty()) return;
            faults.Add(where + what + " wrote " + damage + " of the surface");
            surface.Buffer().RepairGuards();
        };
        event("SetMode", [&] { overlay->SetMode(mode); });
        event("Draw", [&] { overlay->Draw(true); });
        event("OnMouseDown", [&] { overlay->OnMouseDown(x, y, 0); });
        event("OnMouseMove", [&] { overlay->OnMouseMove(x + 5, y + 3, 0); });
        event("OnMouseUp", [&] { overlay->OnMouseUp(x + 5, y + 3, 0); });
        event("Draw", [&] { overlay->Draw(true); });
    }
    ReportFinding(
        "overlay events", faults,
        "draw, mouse down, move and up in " + std::to_string(modes > 0 ? modes : 1) + " modes");

    Step("overlay", "DeleteOverlay");
    overlay->ReleaseContext();
    overlay->ReleaseInstance();
    if (!NoThrow([&] { mModel->DeleteOverlay(overlay); }, &thrown))
        Report(false, "overlay", "deleting the overlay " + thrown);
}

void ModelRun::CheckCleanUp() {
    Step("cleanup");
    std::string thrown;
    bool prepared = true;
    const bool clean = NoThrow(
        [&] {
            prepared = mInstance->PreProcess();
            mInstance->CleanUp();
        },
        &thrown);
    if (clean) NoThrow([&] { mModel->DeleteInstance(mInstance); }, &thrown);
    mInstance = nullptr;
    mInputs.clear();
    mOutputs.clear();
    Report(thrown.empty() && prepared, "cleanup",
           !thrown.empty() ? (clean ? "deleting the instance " : "CleanUp ") + thrown
           : prepared      ? "CleanUp ended a pending run; the instance was deleted"
                           : "PreProcess answered false before CleanUp");
}

void ModelRun::CheckMemory() {
    std::vector<std::string> leaks;
    for (int c = 0; c < kMemoryClasses; ++c)
        if (gLive[c].blocks != 0)
            leaks.push_back(std::to_string(gLive[c].blocks) + " " + kMemoryClassNames[c] +
                            " blocks (" + std::to_string(gLive[c].bytes) + " bytes)");
    Report(leaks.empty(), "host memory",
           leaks.empty() ? "every block from the host's callbacks was given back"
                         : Join(leaks, ", ") + " never given back");
}

}  // namespace

void ValidateModelHere(const std::string& path, int modelIndex, const ValidateOptions& options,
                       const ValidationSink& sink) {
    ModelRun(path, modelIndex, options, sink).Run();
}

}  // namespace ulk_tools
