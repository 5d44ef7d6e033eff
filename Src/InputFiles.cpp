#include "InputFiles.h"

#include "CommandSettings.h"
#include "Diff/MergeRules.h"
#include "Document/ObjectFileReader.h"
#include "FileUtils.h"
#include "Repair/YAMLTypeInfo.h"

#include <exception>
#include <sstream>

using namespace ovrin_yaml;

namespace {

void ReadAndParse(const std::string& path, OvrinObjects& objects) {
    std::string bytes;
    const ReadResult result = ReadWholeFile(path, bytes);
    if (result == ReadResult::CannotOpen) throw YAMLError("Cannot open file");
    if (result == ReadResult::CannotRead || !ParseYAMLFile(std::move(bytes), objects))
        throw YAMLError("Cannot read file");
}

} // namespace

void ReadYAMLPath(const std::string& path, OvrinObjects& objects) {
    try {
        ReadAndParse(path, objects);
    } catch (const YAMLError& error) {
        throw YAMLError("Error parsing file '" + path + "': " + error.what());
    } catch (const std::exception& error) {
        throw YAMLError("Error parsing file '" + path + "' caught unknown exception: " + error.what());
    }
}

void SetupRules(const std::string& rulesFile) {
    const std::string path =
        rulesFile == kDefaultRulesFile ? GetDataFilesDir() + "mergerules.txt" : rulesFile;
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete)
        throw YAMLError("Cannot open rules file for reading:" + path);
    std::istringstream stream(std::move(text));
    MergeRules::LoadSequenceUniqueKeys(stream);
}

void SetupTypeInfo(const std::string& typeInfoFile) {
    OvrinObjects objects;
    ReadYAMLPath(typeInfoFile, objects);
    GetTypeInfoManager()->Read(objects);
}
