// Validating plug-in modules the way a careful host would load them: what ulk-validate does.
//
// Every model of a module runs through its whole life - open, identity and description, an
// instance and its parameters, PreProcess / Execute / PostProcess on every pixel format the
// validator can build, CleanUp, the overlay, close - and each check gives one line, passed or
// failed. Each model runs in a child process of its own with a time limit, so a plug-in that
// crashes or hangs is reported as such and the run goes on; the parent never loads plug-in
// code. The child sends its lines to the parent through a pipe as it decides them.
//
// Validator is used by one thread; it forks, so call it before starting any other thread.
#ifndef ULK_TOOLS_VALIDATE_H
#define ULK_TOOLS_VALIDATE_H

#include <functional>
#include <map>
#include <string>
#include <vector>

namespace ulk_tools {

/// One check: "PASS name: detail" or "FAIL name: detail".
struct CheckLine {
    bool passed = true;
    std::string name;    ///< what was checked: "identity", "execute RGBA/8", "host memory", ...
    std::string detail;  ///< what was found, on one line
};

/// The line as the tool prints it.
std::string FormatCheckLine(const CheckLine& check);

/// How thoroughly and how long.
struct ValidateOptions {
    int timeoutSeconds = 20;  ///< wall-clock limit of one model's child process
    bool quick = false;       ///< skip the 1920x1080 frames
};

/// Everything found about one model (index -1: the module itself could not be validated).
struct ModelReport {
    std::string path;
    int index = 0;
    std::string name;        ///< the model's name, "" when unknown
    std::string identifier;  ///< the model's identifier, "" when none
    std::vector<CheckLine> checks;
    bool finished = false;  ///< the child ran to its end
    std::string abort;      ///< why it did not: "crashed with SIGSEGV", "timed out after 20 s"

    /// True when the child finished and no check failed.
    bool Passed() const;
    /// "model 3 (curves)", "model 3" without a name, or "module" for index -1.
    std::string Label() const;
    /// "PASS model 0 (Levels): 12 checks passed", "FAIL model 3 (curves): timed out after 20 s"
    /// or "FAIL model 1 (Blur): 2 of 12 checks failed".
    std::string Summary() const;
};

/// Runs models in child processes and keeps what a run has seen across modules.
class Validator {
  public:
    explicit Validator(ValidateOptions options) : mOptions(options) {}

    /// Called before a model's child starts: the module, the model index, the module's count.
    using StartFunction = std::function<void(const std::string& path, int index, int count)>;
    /// Called with each finished report, in order.
    using ReportFunction = std::function<void(const ModelReport& report)>;

    /// Validates every model of the module at path. A module that cannot be loaded, has no
    /// model, claims more than 4096 or crashes while counting them gives one report of index -1.
    void ValidateModule(const std::string& path, const StartFunction& start,
                        const ReportFunction& done);

    /// True while every report so far passed.
    bool AllPassed() const { return mAllPassed; }

  private:
    ModelReport ValidateModel(const std::string& path, int index);

    ValidateOptions mOptions;
    std::map<std::string, std::string> mIdentifiers;  ///< identifier -> first model that used it
    bool mAllPassed = true;
};

/// The checks of one model, run in this process; the child's body. Each line goes to check as
/// soon as it is decided; step names the check about to run and where it stands (so that a
/// crash can be placed), identity gives the model's name and identifier once it is open.
struct ValidationSink {
    std::function<void(const CheckLine& check)> check;
    std::function<void(const std::string& name, const std::string& where)> step;
    std::function<void(const std::string& name, const std::string& identifier)> identity;
};
void ValidateModelHere(const std::string& path, int modelIndex, const ValidateOptions& options,
                       const ValidationSink& sink);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_VALIDATE_H
