#include "InputFiles.h"

#include "FileUtils.h"

#include "Diff/RulesReader.h"
#include "Session/ReadInputs.h"

#include <sstream>

using namespace ovrin_yaml;

InputFile FileInput(const std::string& path) {
    return {path, FileSize(path), [path] {
                std::string bytes;
                const ReadResult result = ReadWholeFile(path, bytes);
                if (result == ReadResult::CannotOpen) throw YAMLError("Cannot open file");
                if (result == ReadResult::CannotRead) throw YAMLError("Cannot read file");
                return bytes;
            }};
}

MergeRules SetupRules(const std::string& rulesFile) {
    const std::string path =
        rulesFile == kDefaultRulesFile ? GetDataFilesDir() + "mergerules.txt" : rulesFile;
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete)
        throw YAMLError("Cannot open rules file for reading:" + path);
    std::istringstream stream(std::move(text));
    MergeRules rules;
    LoadSequenceUniqueKeys(stream, rules);
    return rules;
}

YAMLTypeInfoManager SetupTypeInfo(const std::string& typeInfoFile) {
    OvrinObjects objects;
    const InputFile input = FileInput(typeInfoFile);
    ReadInputs({{"Read type info", &input, &objects}}, Threads::None, nullptr, {});
    YAMLTypeInfoManager types;
    types.Read(objects);
    return types;
}
