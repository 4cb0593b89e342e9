#include "ulk_tools/model_info.h"

#include <algorithm>
#include <filesystem>
#include <nlohmann/json.hpp>
#include <sstream>

#include "ulk_tools/arguments.h"
#include "ulk_tools/effect.h"

namespace ulk_tools {

namespace {

std::string Text(const char* text) {
    return text ? text : "";
}

void DescribeModel(const std::string& path, ModelInfo* info) {
    ulkHostModel model(static_cast<short>(info->index));
    if (!OpenModel(&model, path, &info->error)) return;
    info->name = Text(model.GetName());
    info->vendor = Text(model.GetVendor());
    info->category = Text(model.GetCategory());
    info->identifier = Text(model.GetIdentifier());
    info->description = Text(model.GetDescription());
    info->type = PluginTypeText(model.GetType());
    const char* className = ulkHostModel::GetClassName(model.GetClass());
    info->pluginClass = className ? className : std::to_string(model.GetClass());
    info->pluginVersion = model.GetPluginVersion();
    info->interfaceVersion = model.GetULKVersion();
    for (int i = 0; i < model.GetNumFormats(); ++i) {
        const ulkImageFormat* format = model.GetFormat(i);
        info->formats.push_back(
            {format->GetFormat(), ImageFormatText(format->GetFormat()), format->GetBitDepth()});
    }
    for (int i = 0; i < model.GetNumInputs(); ++i) {
        const ulkObjectInfo* port = model.GetInputInfo(i);
        info->inputs.push_back(
            {Text(port->GetName()), Text(port->GetID()), port->IsOptional() != 0});
    }
    for (int i = 0; i < model.GetNumOutputs(); ++i) {
        const ulkObjectInfo* port = model.GetOutputInfo(i);
        info->outputs.push_back({Text(port->GetName()), Text(port->GetID()), false});
    }
    info->hasUI = model.HasUI();
    if (ulkHostOverlay* overlay = model.NewOverlay()) {
        info->hasOverlay = true;
        model.DeleteOverlay(overlay);
    }
    ulkHostInstance* instance = NewInstanceOf(&model, &info->error);
    if (!instance) {
        if (info->error.empty()) info->error = InstanceErrorText(model);
    } else {
        info->parameters = DescribeParameters(instance);
        model.DeleteInstance(instance);
    }
    model.Close();
}

std::string RangeText(const ParameterInfo& p) {
    std::ostringstream out;
    out << FormatDouble(p.minimum) << " to " << FormatDouble(p.maximum) << " step "
        << FormatDouble(p.increment) << (p.integer ? ", integer" : "");
    return out.str();
}

std::string Join(const std::vector<std::string>& texts, const char* separator) {
    std::string joined;
    for (const std::string& text : texts) joined += (joined.empty() ? "" : separator) + text;
    return joined;
}

nlohmann::ordered_json PortsJson(const std::vector<PortInfo>& ports) {
    nlohmann::ordered_json list = nlohmann::ordered_json::array();
    for (const PortInfo& port : ports)
        list.push_back({{"name", port.name}, {"id", port.id}, {"optional", port.optional}});
    return list;
}

nlohmann::ordered_json ParameterJson(const ParameterInfo& p) {
    nlohmann::ordered_json json = {{"kind", p.kind},   {"label", p.label},
                                   {"id", p.id},       {"default", p.defaultText},
                                   {"group", p.group}, {"hidden", p.hidden}};
    if (p.hasRange) {
        json["minimum"] = p.minimum;
        json["maximum"] = p.maximum;
        json["increment"] = p.increment;
        json["integer"] = p.integer;
    }
    if (p.kind == ulkPList::className) json["items"] = p.items;
    nlohmann::ordered_json channels = nlohmann::ordered_json::array();
    for (size_t c = 0; c < p.channelIDs.size(); ++c)
        channels.push_back({{"id", p.channelIDs[c]}, {"label", p.channelLabels[c]}});
    json["channels"] = channels;
    return json;
}

nlohmann::ordered_json ModelJson(const ModelInfo& m) {
    nlohmann::ordered_json json = {{"index", m.index}};
    if (!m.error.empty()) json["error"] = m.error;
    if (m.type.empty()) return json;  // never opened: nothing more is known
    json["name"] = m.name;
    json["vendor"] = m.vendor;
    json["category"] = m.category;
    json["identifier"] = m.identifier;
    json["description"] = m.description;
    json["type"] = m.type;
    json["class"] = m.pluginClass;
    json["plugin_version"] = m.pluginVersion;
    json["interface_version"] = m.interfaceVersion;
    nlohmann::ordered_json formats = nlohmann::ordered_json::array();
    for (const FormatInfo& f : m.formats)
        formats.push_back({{"format", f.name}, {"code", f.code}, {"bit_depth", f.bitDepth}});
    json["formats"] = formats;
    json["inputs"] = PortsJson(m.inputs);
    json["outputs"] = PortsJson(m.outputs);
    json["has_ui"] = m.hasUI;
    json["has_overlay"] = m.hasOverlay;
    nlohmann::ordered_json parameters = nlohmann::ordered_json::array();
    for (const ParameterInfo& p : m.parameters) parameters.push_back(ParameterJson(p));
    json["parameters"] = parameters;
    return json;
}

void PrintPorts(std::ostringstream& out, const char* title, const std::vector<PortInfo>& ports) {
    out << "    " << title << ":";
    if (ports.empty()) out << " none";
    out << "\n";
    for (size_t i = 0; i < ports.size(); ++i)
        out << "      " << i << ": " << ports[i].name << " (" << ports[i].id << ")"
            << (ports[i].optional ? ", optional" : "") << "\n";
}

void PrintModel(std::ostringstream& out, const ModelInfo& m) {
    out << "  model " << m.index;
    if (m.type.empty()) {
        out << ": FAILED: " << m.error << "\n";
        return;
    }
    out << ": " << m.name << "\n";
    if (!m.error.empty()) out << "    FAILED: " << m.error << "\n";
    out << "    vendor: " << m.vendor << "\n    category: " << m.category
        << "\n    identifier: " << m.identifier << "\n    description: " << m.description
        << "\n    type: " << m.type << ", class: " << m.pluginClass
        << "\n    version: " << FormatDouble(m.pluginVersion)
        << ", interface: " << FormatDouble(m.interfaceVersion) << "\n    formats:";
    for (const FormatInfo& f : m.formats) out << " " << f.name << "/" << f.bitDepth;
    out << "\n";
    PrintPorts(out, "inputs", m.inputs);
    PrintPorts(out, "outputs", m.outputs);
    out << "    user interface: " << (m.hasUI ? "yes" : "no")
        << ", overlay: " << (m.hasOverlay ? "yes" : "no") << "\n    parameters:";
    if (m.parameters.empty()) out << " none";
    out << "\n";
    for (const ParameterInfo& p : m.parameters) {
        out << "      " << (p.group.empty() ? "" : "  ") << p.id << " (" << p.kind << ") \""
            << p.label << "\"";
        if (p.kind != ulkPGroup::className) out << " = " << p.defaultText;
        if (p.hasRange) out << ", " << RangeText(p);
        if (!p.items.empty()) out << ", items: " << Join(p.items, " | ");
        if (p.channelIDs.size() > 1) out << ", channels: " << Join(p.channelIDs, ",");
        if (!p.group.empty()) out << ", in " << p.group;
        if (p.hidden) out << ", hidden";
        out << "\n";
    }
}

}  // namespace

bool ModuleInfo::Ok() const {
    return error.empty() && std::all_of(models.begin(), models.end(),
                                        [](const ModelInfo& model) { return model.error.empty(); });
}

std::vector<std::string> FindModuleFiles(const std::vector<std::string>& arguments) {
    namespace fs = std::filesystem;
    std::vector<std::string> files;
    for (const std::string& argument : arguments) {
        std::error_code error;
        if (!fs::is_directory(argument, error)) {
            files.push_back(argument);
            continue;
        }
        std::vector<std::string> found;
        for (fs::recursive_directory_iterator it(argument, error), end; !error && it != end;
             it.increment(error)) {
            if (it->path().extension() == ".so" && it->is_regular_file(error))
                found.push_back(it->path().string());
        }
        std::sort(found.begin(), found.end());
        files.insert(files.end(), found.begin(), found.end());
    }
    return files;
}

ModuleInfo DescribeModule(const std::string& path) {
    ModuleInfo module;
    module.path = path;
    std::string error;
    LoadedModule loaded;
    if (!loaded.Load(path, &error)) {
        module.error = error.substr(path.size() + 2);  // without the "PATH: " prefix
        return module;
    }
    for (int i = 0; i < loaded.NumModels(); ++i) {
        ModelInfo model;
        model.index = i;
        DescribeModel(path, &model);
        module.models.push_back(model);
    }
    return module;
}

std::string ParameterValueText(ulkParameter* parameter, double time) {
    ulkMemoryFile text;
    if (parameter->IsGroup() || !parameter->WriteValue(time, &text)) return "";
    return text.GetText();
}

std::vector<ParameterInfo> DescribeParameters(ulkHostInstance* instance) {
    std::vector<ParameterInfo> parameters;
    for (int i = 0; i < instance->GetNumParameters(); ++i) {
        ulkParameter* parameter = instance->GetParameter(i);
        ParameterInfo p;
        p.kind = parameter->ClassName();
        p.label = Text(parameter->GetLabel());
        p.id = Text(parameter->GetID());
        p.defaultText = ParameterValueText(parameter, 0.0);
        if (parameter->IsNumber()) {
            auto* number = static_cast<ulkPNumber*>(parameter);
            p.hasRange = true;
            p.minimum = number->GetMinimum();
            p.maximum = number->GetMaximum();
            p.increment = number->GetIncrement();
            p.integer = number->GetType() == kPNumberInteger;
        }
        if (parameter->IsList()) {
            auto* list = static_cast<ulkPList*>(parameter);
            for (int item = 0; item < list->GetNumItems(); ++item)
                p.items.push_back(Text(list->GetListItem(item)));
        }
        for (int c = 0; c < parameter->GetNumChannels(); ++c) {
            p.channelIDs.push_back(Text(parameter->GetChannelID(c)));
            p.channelLabels.push_back(Text(parameter->GetChannelLabel(c)));
        }
        if (ulkParameter* group = parameter->GetGroup()) p.group = Text(group->GetID());
        p.hidden = parameter->IsHidden();
        parameters.push_back(p);
    }
    return parameters;
}

std::string ModulesAsText(const std::vector<ModuleInfo>& modules) {
    std::ostringstream out;
    for (const ModuleInfo& module : modules) {
        out << module.path << "\n";
        if (!module.error.empty()) out << "  FAILED: " << module.error << "\n";
        for (const ModelInfo& model : module.models) PrintModel(out, model);
    }
    return out.str();
}

std::string ModulesAsJson(const std::vector<ModuleInfo>& modules) {
    nlohmann::ordered_json list = nlohmann::ordered_json::array();
    for (const ModuleInfo& module : modules) {
        nlohmann::ordered_json json = {{"path", module.path}, {"ok", module.Ok()}};
        if (!module.error.empty()) json["error"] = module.error;
        nlohmann::ordered_json models = nlohmann::ordered_json::array();
        for (const ModelInfo& model : module.models) models.push_back(ModelJson(model));
        json["models"] = models;
        list.push_back(json);
    }
    // Invalid UTF-8 from a module's texts is replaced rather than thrown about.
    return nlohmann::ordered_json({{"modules", list}})
               .dump(2, ' ', false, nlohmann::ordered_json::error_handler_t::replace) +
           "\n";
}

}  // namespace ulk_tools
