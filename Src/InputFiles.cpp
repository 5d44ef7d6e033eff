#include "InputFiles.h"

#include "CommandSettings.h"
#include "Diff/RulesReader.h"
#include "FileUtils.h"

#include <exception>
#include <sstream>

using namespace ovrin_yaml;

void TakeFile(const std::string& path, ObjectFile& file) {
    std::string bytes;
    const ReadResult result = ReadWholeFile(path, bytes);
    if (result == ReadResult::CannotOpen) throw YAMLError("Cannot open file");
    if (result == ReadResult::CannotRead) throw YAMLError("Cannot read file");
    file.Take(std::move(bytes));
}

void ReadYAMLPath(const std::string& path, OvrinObjects& objects) {
    WithFileName(path, [&] {
        ObjectFile file(objects, {});
        TakeFile(path, file);
        file.Cut(nullptr);
        for (std::size_t piece = 0; piece < file.PieceCount(); ++piece) file.ReadPiece(piece);
        file.Finish();
    });
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
    ReadYAMLPath(typeInfoFile, objects);
    YAMLTypeInfoManager types;
    types.Read(objects);
    return types;
}
