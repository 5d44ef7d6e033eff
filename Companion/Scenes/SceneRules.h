#pragma once

#include "InputFiles.h"

#include "Diff/MergeRules.h"
#include "Repair/YAMLTypeInfo.h"

#include <string>

namespace ovrin {

/// Where the user keeps what is known of the format of scenes.
struct FormatFiles {
    std::string rules = kDefaultRulesFile;       ///< "auto": the file beside the program
    std::string typeInfo = kDefaultTypeInfoFile; ///< empty: none

    /// What the environment says by OVRIN_RULES and OVRIN_TYPE_INFO, empty ones aside.
    static FormatFiles OfEnvironment();
    /// The names for whoever stands elsewhere later; empty for the files that are taken by default.
    std::string LastingRules() const;
    std::string LastingTypeInfo() const;
};

/// What is known of the format of scenes.
struct SceneRules {
    ovrin_yaml::MergeRules rules;
    ovrin_yaml::YAMLTypeInfoManager types; ///< not loaded if there is no such file
};

/// Reads the type information in that file; an empty one if there is no such name. Throws BadSetting that
/// names the file and what is wrong with it.
ovrin_yaml::YAMLTypeInfoManager ReadTypeInfo(const std::string& file);

/// Reads both files. Throws Failure likewise.
SceneRules ReadSceneRules(const FormatFiles& files);

} // namespace ovrin
