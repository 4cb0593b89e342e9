// What a module offers, as plain data: the identity, description and parameters of each of
// its models, read by opening every model and making one instance of it. ulk-info prints
// it as text or JSON; the tests read the JSON back.
#ifndef ULK_TOOLS_MODEL_INFO_H
#define ULK_TOOLS_MODEL_INFO_H

#include <string>
#include <vector>

#include "ulk/ulk.h"

namespace ulk_tools {

/// One parameter of a fresh instance.
struct ParameterInfo {
    std::string kind;  ///< the class name: "Number", "List", "ColorRGB", ...
    std::string label;
    std::string id;
    std::string defaultText;  ///< the value at time 0 in its text form ("" for groups)
    bool hasRange = false;    ///< numbers: minimum, maximum, increment below are set
    double minimum = 0, maximum = 0, increment = 0;
    bool integer = false;            ///< numbers: integer rather than real
    std::vector<std::string> items;  ///< lists: the item texts
    std::vector<std::string> channelIDs;
    std::vector<std::string> channelLabels;
    std::string group;  ///< identifier of the enclosing group, "" at top level
    bool hidden = false;
};

/// One accepted pixel format.
struct FormatInfo {
    int32_t code = 0;
    std::string name;  ///< "RGBA", "Any", ...
    int bitDepth = 0;
};

/// One input or output.
struct PortInfo {
    std::string name;
    std::string id;
    bool optional = false;
};

/// One model of a module; error is set when it could not be opened or instantiated.
struct ModelInfo {
    int index = 0;
    std::string error;
    std::string name, vendor, category, identifier, description;
    std::string type, pluginClass;
    double pluginVersion = 0, interfaceVersion = 0;
    std::vector<FormatInfo> formats;
    std::vector<PortInfo> inputs, outputs;
    bool hasUI = false;
    bool hasOverlay = false;
    std::vector<ParameterInfo> parameters;
};

/// One module; error is set when it could not be loaded or started.
struct ModuleInfo {
    std::string path;
    std::string error;
    std::vector<ModelInfo> models;
    /// True when the module and every model opened.
    bool Ok() const;
};

/// The module files named by the arguments: files as given, folders searched (recursively)
/// for "*.so", sorted. Arguments that name nothing are returned as they are, so that
/// describing them reports the error.
std::vector<std::string> FindModuleFiles(const std::vector<std::string>& arguments);

/// Opens every model of the module at path and describes it.
ModuleInfo DescribeModule(const std::string& path);

/// Describes the parameters of an instance.
std::vector<ParameterInfo> DescribeParameters(ulkHostInstance* instance);

/// The value of parameter at time in its text form ("" when it has none).
std::string ParameterValueText(ulkParameter* parameter, double time);

/// Human-readable description of modules.
std::string ModulesAsText(const std::vector<ModuleInfo>& modules);

/// {"modules": [...]} with every field of the structures above, indented.
std::string ModulesAsJson(const std::vector<ModuleInfo>& modules);

}  // namespace ulk_tools

#endif  // ULK_TOOLS_MODEL_INFO_H
