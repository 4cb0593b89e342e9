// Effects for the benchmarks, as cheap as an effect can be, so that what is
// measured is the runtime around them:
//   model 0 "bench.null"    no parameters; Execute touches no pixel
//   model 1 "bench.null32"  32 real numbers p0 to p31; Execute only reads them
//   model 2 "bench.pass32"  the same 32 numbers; Execute copies input to output
// Every Execute folds the parameter values into a sum that the instance keeps,
// so that the values the host wrote are really read.
#include <cstdio>

#include "ulk/ulk.h"

namespace {

constexpr int kMaxParams = 32;

struct ModelInfo {
    const char* name;
    const char* identifier;
    int params;
    bool copies;
};

const ModelInfo kModels[] = {
    {"Null", "bench.null", 0, false},
    {"Null 32", "bench.null32", kMaxParams, false},
    {"Pass 32", "bench.pass32", kMaxParams, true},
};
constexpr int kNumModels = sizeof kModels / sizeof kModels[0];

class BenchInstance : public ulkInstance_v1 {
  public:
    explicit BenchInstance(const ModelInfo& info) : mInfo(info) {}

    bool DefineParameters() override {
        for (int i = 0; i < mInfo.params; ++i) {
            char id[16];
            std::snprintf(id, sizeof id, "p%d", i);
            ulkParameter* made = ulkPNumber::New(id, id, &mValues[i], sizeof mValues[i], -1000.0,
                                                 1000.0, 0.1, kPNumberReal, false);
            if (!made || !AddParameter(made, nullptr)) {
                ulkParameter::Delete(made);
                return false;
            }
        }
        return true;
    }

    bool Execute(const ulkBounds* bounds) override {
        double sum = 0.0;
        for (int i = 0; i < mInfo.params; ++i) sum += mValues[i];
        mSum += sum;
        if (!mInfo.copies) return true;
        auto* in = dynamic_cast<ulkImage*>(GetInput(0));
        auto* out = dynamic_cast<ulkImage*>(GetOutput(0));
        if (!in || !out) return false;
        return in == out || out->Copy(in, bounds);
    }

  private:
    const ModelInfo& mInfo;
    double mValues[kMaxParams] = {};
    double mSum = 0.0;
};

class BenchModel : public ulkModel_v1 {
  public:
    explicit BenchModel(const ModelInfo& info) : mInfo(info) {}

    bool DefineIdentity() override {
        SetName(mInfo.name);
        SetIdentifier(mInfo.identifier);
        SetVendor("ULK benchmarks");
        SetType(kPluginTypeFilter);
        return true;
    }
    ulkInstance_v1* NewInstance() override { return new BenchInstance(mInfo); }

  private:
    const ModelInfo& mInfo;
};

}  // namespace

ULK_PLUGIN_EXPORT int ulkNumModels_v1(void) {
    return kNumModels;
}

ULK_PLUGIN_EXPORT ulkModel_v1* ulkNewModel_v1(unsigned short modelIndex) {
    return modelIndex < kNumModels ? new BenchModel(kModels[modelIndex]) : nullptr;
}
