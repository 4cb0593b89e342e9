#include "ulk_tools/validate.h"

#include <exception>

#include "ulk_tools/arguments.h"
#include "ulk_tools/effect.h"
#include "ulk_tools/validate_process.h"

namespace ulk_tools {

namespace {

// The child's lines: a tag, then fields separated by tabs.
//   P/F  name  detail     a check passed / failed
//   R    name  where      a check is about to run
//   N    name  identifier the model's identity
//   D                     the child finished
//   C    count            the module's model count
//   E    message          the module could not be loaded
constexpr char kSeparator = '\t';

// More models than any real module offers (a bridge to a folder of effects offers a few
// hundred).
constexpr int kMaxModels = 4096;

// Plug-in texts become one field of one line.
std::string Field(const std::string& text) {
    std::string field = text;
    for (char& c : field)
        if (c == '\n' || c == '\r' || c == kSeparator) c = ' ';
    return field;
}

std::string Line(char tag, const std::string& a = std::string(),
                 const std::string& b = std::string()) {
    return std::string(1, tag) + kSeparator + Field(a) + kSeparator + Field(b);
}

struct Message {
    char tag = 0;
    std::string a, b;
};

Message Parse(const std::string& line) {
    Message message;
    if (line.empty()) return message;
    message.tag = line[0];
    const size_t first = line.find(kSeparator);
    if (first == std::string::npos) return message;
    const size_t second = line.find(kSeparator, first + 1);
    message.a = line.substr(first + 1,
                            second == std::string::npos ? std::string::npos : second - first - 1);
    if (second != std::string::npos) message.b = line.substr(second + 1);
    return message;
}

// A file name is enough to tell modules apart in messages.
std::string BaseName(const std::string& path) {
    const size_t slash = path.rfind('/');
    return slash == std::string::npos ? path : path.substr(slash + 1);
}

}  // namespace

std::string FormatCheckLine(const CheckLine& check) {
    return std::string(check.passed ? "PASS " : "FAIL ") + check.name +
           (check.detail.empty() ? std::string() : ": " + check.detail);
}

bool ModelReport::Passed() const {
    if (!finished) return false;
    for (const CheckLine& check : checks)
        if (!check.passed) return false;
    return true;
}

std::string ModelReport::Label() const {
    if (index < 0) return "module";
    return "model " + std::to_string(index) + (name.empty() ? std::string() : " (" + name + ")");
}

std::string ModelReport::Summary() const {
    int failed = 0;
    for (const CheckLine& check : checks) failed += check.passed ? 0 : 1;
    std::string detail;
    if (!finished)
        detail = abort;
    else if (failed == 0)
        detail = std::to_string(checks.size()) + " checks passed";
    else
        detail = std::to_string(failed) + " of " + std::to_string(checks.size()) + " checks failed";
    return FormatCheckLine(CheckLine{Passed(), Label(), detail});
}

void Validator::ValidateModule(const std::string& path, const StartFunction& start,
                               const ReportFunction& done) {
    // Counting loads the module, whose start-up code may crash too: a child does it.
    const ChildResult counted = RunInChild(mOptions.timeoutSeconds, [&path](int fd) {
        InstallHostServices(1);
        std::string error;
        int count = -1;
        try {
            count = CountModels(path, &error);
        } catch (...) {
            error = path + ": the module threw while starting";
        }
        WriteLine(fd, count >= 0 ? Line('C', std::to_string(count)) : Line('E', error));
    });
    ModelReport module;
    module.path = path;
    module.index = -1;
    int count = -1;
    for (const std::string& line : counted.lines) {
        const Message message = Parse(line);
        if (message.tag == 'C' && ParseInt(message.a, &count)) module.finished = true;
        if (message.tag == 'E') {
            module.finished = true;
            module.checks.push_back(CheckLine{false, "load", message.a});
        }
    }
    if (!module.finished)
        module.abort =
            "loading " + BaseName(path) + " " + counted.EndingText(mOptions.timeoutSeconds);
    else if (count == 0)
        module.checks.push_back(CheckLine{false, "load", path + ": the module offers no model"});
    if (count > kMaxModels) {
        // A negative count read as 16 bits claims tens of thousands of models; a host would
        // refuse such a module rather than open them all.
        module.checks.push_back(CheckLine{false, "model count",
                                          "the module claims " + std::to_string(count) +
                                              " models, more than " + std::to_string(kMaxModels) +
                                              "; none validated"});
        count = 0;
    }
    if (!module.checks.empty() || !module.finished) {
        mAllPassed = false;
        done(module);
    }
    for (int index = 0; index < count; ++index) {
        if (start) start(path, index, count);
        ModelReport report = ValidateModel(path, index);
        mAllPassed = mAllPassed && report.Passed();
        done(report);
    }
}

ModelReport Validator::ValidateModel(const std::string& path, int index) {
    const ValidateOptions options = mOptions;
    const ChildResult child = RunInChild(mOptions.timeoutSeconds, [&](int fd) {
        ValidationSink sink;
        sink.check = [fd](const CheckLine& check) {
            WriteLine(fd, Line(check.passed ? 'P' : 'F', check.name, check.detail));
        };
        sink.step = [fd](const std::string& name, const std::string& where) {
            WriteLine(fd, Line('R', name, where));
        };
        sink.identity = [fd](const std::string& name, const std::string& identifier) {
            WriteLine(fd, Line('N', name, identifier));
        };
        ValidateModelHere(path, index, options, sink);
        WriteLine(fd, Line('D'));
    });

    ModelReport report;
    report.path = path;
    report.index = index;
    Message running;
    for (const std::string& line : child.lines) {
        const Message message = Parse(line);
        switch (message.tag) {
            case 'P':
            case 'F':
                report.checks.push_back(CheckLine{message.tag == 'P', message.a, message.b});
                break;
            case 'R':
                running = message;
                break;
            case 'N':
                report.name = message.a;
                report.identifier = message.b;
                break;
            case 'D':
                report.finished = true;
                break;
            default:
                break;
        }
    }
    if (!report.finished) {
        // The check that was running takes the blame, and the summary says what happened.
        const std::string ending = child.EndingText(mOptions.timeoutSeconds);
        const std::string where = running.b.empty() ? running.a : running.a + " " + running.b;
        report.checks.push_back(CheckLine{false, running.a.empty() ? "start" : running.a,
                                          ending + (where.empty() ? "" : " during " + where)});
        report.abort = ending + (running.a.empty() ? "" : " during " + running.a);
    }
    if (!report.identifier.empty()) {
        // Hosts find effects again by identifier, across every module they load.
        const std::string here = BaseName(path) + " model " + std::to_string(index);
        const auto known = mIdentifiers.emplace(report.identifier, here);
        report.checks.push_back(
            known.second
                ? CheckLine{true, "identifier unique", report.identifier}
                : CheckLine{false, "identifier unique",
                            "'" + report.identifier + "' is also used by " + known.first->second});
    }
    return report;
}

}  // namespace ulk_tools
