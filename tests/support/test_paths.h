// Where the test programs find the modules the build made.
#ifndef ULK_TEST_PATHS_H
#define ULK_TEST_PATHS_H

#include <string>

/// Full path of the test plug-in module <name>.so.
inline std::string TestPluginPath(const std::string& name) {
    return std::string(ULK_TEST_PLUGIN_DIR) + "/" + name + ".so";
}

/// Full path of the sample plug-in module <name>.so.
inline std::string SamplePluginPath(const std::string& name) {
    return std::string(ULK_PLUGIN_DIR) + "/" + name + ".so";
}

#endif  // ULK_TEST_PATHS_H
