#include "InputFiles.h"

#include "Descriptor.h"
#include "FileUtils.h"

#include "Diff/RulesReader.h"
#include "Session/ReadInputs.h"

#include <fcntl.h>
#include <memory>
#include <sstream>
#include <unistd.h>

using namespace ovrin_yaml;

namespace {

constexpr const char *kCannotOpen = "Cannot open file", *kCannotRead = "Cannot read file";

std::string WholeFile(const std::string& path) {
    std::string bytes;
    const ReadResult result = ReadWholeFile(path, bytes);
    if (result == ReadResult::CannotOpen) throw YAMLError(kCannotOpen);
    if (result == ReadResult::CannotRead) throw YAMLError(kCannotRead);
    return bytes;
}

ByteSource Opened(const std::string& path) {
    const auto file = std::make_shared<Descriptor>(OpenFile(path.c_str(), O_RDONLY));
    if (!file->IsOpen()) throw YAMLError(kCannotOpen);
    return [file](char* bytes, std::size_t size) {
        const ssize_t count = Uninterrupted([&] { return read(file->Get(), bytes, size); });
        if (count < 0) throw YAMLError(kCannotRead);
        return static_cast<std::size_t>(count);
    };
}

PartSource OpenedInParts(const std::string& path) {
    const auto file = std::make_shared<Descriptor>(OpenFile(path.c_str(), O_RDONLY));
    if (!file->IsOpen()) throw YAMLError(kCannotOpen);
    return [file](std::size_t offset, char* bytes, std::size_t size) {
        const ssize_t count =
            Uninterrupted([&] { return pread(file->Get(), bytes, size, static_cast<off_t>(offset)); });
        if (count < 0) throw YAMLError(kCannotRead);
        return static_cast<std::size_t>(count);
    };
}

} // namespace

InputFile FileInput(const std::string& path) {
    // Less is read at one go.
    constexpr std::size_t kMuch = std::size_t{4} << 20;
    const std::string native = OvrinToNativePath(path);
    InputFile input{path, FileSize(path), [native] { return WholeFile(native); }, {}, {}};
    if (input.size >= kMuch) {
        input.open = [native] { return Opened(native); };
        input.openParts = [native] { return OpenedInParts(native); };
    }
    return input;
}

MergeRules SetupRules(const std::string& rulesFile) {
    const std::string path =
        rulesFile == kDefaultRulesFile ? GetDataFilesDir() + "mergerules.txt" : rulesFile;
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete)
        throw YAMLError("Cannot open rules file for reading:" + path);
    std::istringstream stream(std::move(text));
    // It would take a lack of memory for the end of the text.
    stream.exceptions(std::ios_base::badbit);
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
