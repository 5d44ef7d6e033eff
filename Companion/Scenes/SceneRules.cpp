#include "Scenes/SceneRules.h"

#include "Words/Failure.h"

#include "Values/YAMLError.h"

#include <cstdlib>
#include <filesystem>
#include <new>
#include <system_error>

namespace ovrin {

namespace {

/// What `read` returns; whatever it throws becomes a Failure.
template <class Read> auto OrFailure(const char* what, const std::string& path, const Read& read) {
    const auto fail = [&](std::string reason) {
        while (reason.ends_with('\n')) reason.pop_back();
        throw BadSetting("The " + std::string(what) + " " + path + " can't be used: " + reason);
    };
    try {
        return read();
    } catch (const ovrin_yaml::YAMLError& error) {
        fail(error.what());
    } catch (const std::bad_alloc&) {
        throw;
    } catch (const std::exception& error) {
        fail(error.what());
    }
    __builtin_unreachable();
}

void TakeVariable(const char* name, std::string& value) {
    const char* text = std::getenv(name);
    if (text && *text) value = text;
}

std::string Lasting(const std::string& file, const std::string& byDefault) {
    if (file == byDefault) return {};
    std::error_code error;
    const std::filesystem::path absolute = std::filesystem::absolute(file, error);
    return error ? file : absolute.string();
}

} // namespace

std::string FormatFiles::LastingRules() const {
    return Lasting(rules, kDefaultRulesFile);
}

std::string FormatFiles::LastingTypeInfo() const {
    return Lasting(typeInfo, kDefaultTypeInfoFile);
}

FormatFiles FormatFiles::OfEnvironment() {
    FormatFiles files;
    TakeVariable("OVRIN_RULES", files.rules);
    TakeVariable("OVRIN_TYPE_INFO", files.typeInfo);
    return files;
}

ovrin_yaml::YAMLTypeInfoManager ReadTypeInfo(const std::string& file) {
    if (file == kDefaultTypeInfoFile) return {};
    return OrFailure("type information", file, [&] { return SetupTypeInfo(file); });
}

SceneRules ReadSceneRules(const FormatFiles& files) {
    return {OrFailure("rules file", files.rules, [&] { return SetupRules(files.rules); }),
            ReadTypeInfo(files.typeInfo)};
}

} // namespace ovrin
