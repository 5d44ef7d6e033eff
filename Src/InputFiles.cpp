#include "InputFiles.h"

#include "CommandSettings.h"
#include "FileUtils.h"
#include "TimerStat.h"

#include "Diff/MergeRules.h"
#include "Repair/YAMLTypeInfo.h"
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
    const InputFile input = FileInput(typeInfoFile);
    ReadInputs({{"Read type info", &input, &objects}}, Threads::None, nullptr, {});
    GetTypeInfoManager()->Read(objects);
}

void SetupRulesAndTypes(TimerStat& root, TimerStat& reading, const std::string& rulesFile,
                        const std::string& typeInfoFile) {
    {
        TimerStat timer(reading, "Reading unique keys");
        SetupRules(rulesFile);
    }
    if (typeInfoFile == kDefaultTypeInfoFile) return;
    TimerStat timer(root, "Read type info");
    SetupTypeInfo(typeInfoFile);
}
