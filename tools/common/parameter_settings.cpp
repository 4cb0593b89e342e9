#include "ulk_tools/parameter_settings.h"

#include <cmath>
#include <exception>

#include "ulk_tools/model_info.h"

namespace ulk_tools {

namespace {

std::string KnownIdentifiers(ulkHostInstance* instance) {
    std::string ids;
    for (int i = 0; i < instance->GetNumParameters(); ++i) {
        ulkParameter* parameter = instance->GetParameter(i);
        if (parameter->IsGroup() || !parameter->GetID()) continue;
        ids += (ids.empty() ? "" : ", ") + std::string(parameter->GetID());
    }
    return ids.empty() ? "it has no parameters" : "it has: " + ids;
}

ulkParameter* Find(ulkHostInstance* instance, const std::string& id, std::string* error) {
    ulkParameter* parameter = instance->FindParameter(id.c_str());
    if (!parameter || parameter->IsGroup()) {
        *error = "unknown parameter '" + id + "' (" + KnownIdentifiers(instance) + ")";
        return nullptr;
    }
    return parameter;
}

// The library reads every text but "1" and "true" as false; a typo should not pass as false.
bool IsBooleanText(const std::string& text) {
    return text == "0" || text == "1" || text == "true" || text == "false";
}

bool Parse(ulkParameter* parameter, double time, const std::string& text, std::string* error) {
    if (parameter->IsBoolean() && !IsBooleanText(text)) {
        *error = "parameter '" + std::string(parameter->GetID()) + "': '" + text +
                 "' is not a boolean (true, false, 1 or 0)";
        return false;
    }
    bool parsed = false;
    const char* thrown = nullptr;
    // A string parameter throws its message when the text does not fit.
    try {
        parsed = parameter->ParseValue(time, text.c_str());
    } catch (const char* message) {
        thrown = message;
    } catch (const std::exception& e) {
        thrown = e.what();
    } catch (...) {
        thrown = "the plug-in's parameter refused it";
    }
    if (parsed && !thrown) return true;
    std::string expected;
    if (parameter->IsList()) {
        auto* list = static_cast<ulkPList*>(parameter);
        for (int i = 0; i < list->GetNumItems(); ++i)
            expected +=
                std::string(i ? ", " : "") + (list->GetListItem(i) ? list->GetListItem(i) : "");
        expected = "one of: " + expected;
    } else if (parameter->IsNumber()) {
        expected = "a number";
    } else if (parameter->IsColorRGB() || parameter->IsColorHSV()) {
        expected = "three numbers, as 1,0.5,0";
    } else if (parameter->IsPoint2D()) {
        expected = "two numbers, as 0.5,0.5";
    } else if (parameter->IsRect2D()) {
        expected = "four numbers, as 0,0,1,1";
    }
    *error = "parameter '" + std::string(parameter->GetID()) + "' (" + parameter->ClassName() +
             "): cannot read '" + text + "'" +
             (thrown             ? std::string(": ") + thrown
              : expected.empty() ? std::string()
                                 : "; expected " + expected);
    return false;
}

// The value for the whole shot: one key at time 0 and no other.
bool SetConstant(ulkParameter* parameter, const std::string& text, std::string* error) {
    if (!Parse(parameter, 0.0, text, error)) return false;
    const int kept = parameter->GetKeyIndex(0.0);
    for (int i = parameter->GetNumKeys() - 1; i >= 0; --i)
        if (i != kept) parameter->ClearKey(i);
    return true;
}

}  // namespace

double FrameTime(ulkHostInstance* instance, int frame) {
    const int current = instance->GetCurrentFrame();
    instance->SetCurrentFrame(frame);
    const double time = instance->GetTime();
    instance->SetCurrentFrame(current);
    return time;
}

bool ApplyParameterSettings(ulkHostInstance* instance, const ParameterSettings& settings,
                            std::string* error) {
    for (const SetArgument& set : settings.sets) {
        if (set.hasTime) continue;
        ulkParameter* parameter = Find(instance, set.id, error);
        if (!parameter || !SetConstant(parameter, set.text, error)) return false;
    }
    for (const KeyFileKeys& file : settings.keyFiles) {
        for (const KeyLine& key : file.keys) {
            ulkParameter* parameter = Find(instance, key.id, error);
            if (!parameter || !Parse(parameter, key.time, key.text, error)) {
                *error = file.path + ":" + std::to_string(key.line) + ": " + *error;
                return false;
            }
        }
    }
    for (const SetArgument& set : settings.sets) {
        if (!set.hasTime) continue;
        ulkParameter* parameter = Find(instance, set.id, error);
        if (!parameter) return false;
        if (set.time != std::floor(set.time) || std::fabs(set.time) > 1e9) {
            *error = "--set " + set.id + "@" + FormatDouble(set.time) +
                     ": the part after @ is a frame number (a whole number)";
            return false;
        }
        if (!Parse(parameter, FrameTime(instance, static_cast<int>(set.time)), set.text, error))
            return false;
    }
    return true;
}

std::vector<KeyLine> CollectKeys(ulkHostInstance* instance) {
    std::vector<KeyLine> keys;
    for (int i = 0; i < instance->GetNumParameters(); ++i) {
        ulkParameter* parameter = instance->GetParameter(i);
        if (parameter->IsGroup() || !parameter->GetID()) continue;
        for (int k = 0; k < parameter->GetNumKeys(); ++k) {
            KeyLine key;
            key.id = parameter->GetID();
            key.time = parameter->GetKeyTime(k);
            key.text = ParameterValueText(parameter, key.time);
            keys.push_back(key);
        }
    }
    return keys;
}

}  // namespace ulk_tools
