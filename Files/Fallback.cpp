#include "Fallback.h"

#include "ErrMsg.h"
#include "FileUtils.h"

#include <algorithm>
#include <cerrno>
#include <cstdlib>
#include <cstring>
#include <fstream>
#include <iostream>
#include <iterator>
#include <optional>
#include <sys/wait.h>
#include <utility>

namespace {

std::stringstream errs;

const std::string kSpecFileName = "mergespecfile.txt";
const std::string kAnyExtension = "*";
const std::string kProgramsPlaceholder = "%programs%";
constexpr const char* kBlanks = " \t";
constexpr const char* kModes[] = {"use", "use-on-conflict", "use-second-pass"};

/// The position in kModes, or nothing.
std::optional<int> ModeFromText(const std::string& text) {
    const auto mode = std::find(std::begin(kModes), std::end(kModes), text);
    if (mode == std::end(kModes)) return std::nullopt;
    return static_cast<int>(mode - kModes);
}

/// A cursor over one line.
struct Parser {
    const std::string& line;
    std::size_t pos = 0;

    void skipBlanks() { pos = std::min(line.find_first_not_of(kBlanks, pos), line.size()); }

    /// The text up to the next blank, where the cursor then stands. Without a blank the text is empty and the
    /// cursor stays.
    std::string readWord() {
        const std::size_t end = line.find_first_of(kBlanks, pos);
        return end == std::string::npos ? std::string() : readUpTo(end);
    }

    /// The text between the next two double quotes, behind which the cursor then stands. Without two of them
    /// the text is empty and the cursor stays.
    std::string readQuoted() {
        const std::size_t open = line.find('"', pos);
        if (open == std::string::npos) return {};
        const std::size_t close = line.find('"', open + 1);
        if (close == std::string::npos) return {};
        pos = close + 1;
        return line.substr(open + 1, close - open - 1);
    }

    std::string readRest() { return readUpTo(line.size()); }

private:
    std::string readUpTo(std::size_t end) {
        const std::size_t start = std::exchange(pos, end);
        return line.substr(start, end - start);
    }
};

/// Replaces every `placeholder` in `text`. The search goes on `step` characters behind each place.
std::string ReplaceAll(std::string text, const std::string& placeholder, const std::string& replacement,
                       std::size_t step) {
    for (std::size_t at = text.find(placeholder); at != std::string::npos;
         at = text.find(placeholder, at + step))
        text.replace(at, placeholder.size(), replacement);
    return text;
}

/// The search goes on inside the path that was put in, but for one that holds the placeholder behind its
/// first character: that would never end.
std::string PutInPath(const std::string& arguments, const std::string& placeholder, const std::string& path) {
    const bool endless = path.find(placeholder, 1) != std::string::npos;
    return ReplaceAll(arguments, placeholder, path, endless ? path.size() : 1);
}

void AddEntries(std::vector<FallbackCommandEntry>& entries, const FallbackCommandEntry& entry) {
    if (entry.path.find(kProgramsPlaceholder) == std::string::npos) {
        entries.push_back(entry);
        return;
    }
    const std::string folder = "/Applications";
    for (const std::string& programs : {folder, GetUserHomeDir() + folder})
        entries.push_back({ReplaceAll(entry.path, kProgramsPlaceholder, programs, programs.size()),
                           entry.arguments, entry.mode});
}

/// False, and reported, for an unknown mode.
bool ReadToolLine(const std::string& line, int lineNumber, FallbackCommandMap& fallbacks) {
    Parser parser{line};
    const std::string extension = parser.readWord();
    parser.skipBlanks();
    const std::string modeText = parser.readWord();
    const std::optional<int> mode = ModeFromText(modeText);
    if (!mode) {
        errs << "Unknown mode '" << modeText << "' on line " << lineNumber << '\n';
        ErrMsg(errs);
        return false;
    }
    const std::string path = parser.readQuoted();
    parser.skipBlanks();
    AddEntries(fallbacks[extension], {path, parser.readRest(), *mode});
    return true;
}

bool ReadSpecFile(const std::string& fileName, FallbackCommandMap& fallbacks) {
    std::string text;
    if (ReadWholeFile(fileName, text) != ReadResult::Complete) return false;
    std::istringstream stream(std::move(text));
    std::string line;
    for (int lineNumber = 1; std::getline(stream, line); ++lineNumber)
        if (!line.empty() && line[0] != '#' && !ReadToolLine(line, lineNumber, fallbacks)) return false;
    return true;
}

const FallbackCommandEntry* FindExistingTool(const FallbackCommandMap& fallbacks,
                                             const std::string& extension) {
    const auto candidates = fallbacks.find(extension);
    if (candidates == fallbacks.end()) return nullptr;
    for (const FallbackCommandEntry& entry : candidates->second)
        if (FileExists(entry.path.c_str())) return &entry;
    return nullptr;
}

/// Where no process is to be had, some C libraries give the status of a missing shell instead of -1.
bool IsWithoutProcess(int status, int error) {
    constexpr int kNoShell = 127;
    return WIFEXITED(status) && WEXITSTATUS(status) == kNoShell && (error == EAGAIN || error == ENOMEM);
}

/// Runs the tool and gives the shell call's status as it is.
ExitStatus RunTool(const std::string& path, const std::string& arguments) {
    const std::string command = '"' + path + "\" " + arguments;
    std::cout.flush(); // what was printed so far stands before what the tool prints
    errno = 0;
    int status = std::system(command.c_str());
    const int error = errno;
    if (IsWithoutProcess(status, error)) status = -1;
    if (status == -1 || (status == 0 && error == ENOENT)) {
        errs << "Could not start fallback merge command '" << path << "' code " << status << ' '
             << std::strerror(error) << '\n';
        ErrMsg(errs);
    }
    return static_cast<ExitStatus>(status);
}

} // namespace

std::string GetSpecFilename(const std::string& name) {
    if (name != kDefaultSpecFile) return name;
    const std::string ofUser = GetUserHomeDir() + "/." + kSpecFileName;
    return FileExists(ofUser.c_str()) ? ofUser : GetDataFilesDir() + kSpecFileName;
}

FallbackCommandMap PopulateFallbacks(const std::string& fileName) {
    FallbackCommandMap fallbacks;
    if (fileName.empty() || ReadSpecFile(fileName, fallbacks)) return fallbacks;
    errs << "Couldn't load spec file '" << fileName << "'\n";
    ErrMsg(errs);
    return fallbacks;
}

FallbackCommandEntry GetFallbackCommandEntry(const FallbackCommandMap& fallbacks, const std::string& fileName,
                                             const std::string& specFile) {
    const std::string extension = GetFileExtension(fileName);
    for (const std::string& key : {extension, kAnyExtension})
        if (const FallbackCommandEntry* entry = FindExistingTool(fallbacks, key)) return *entry;
    errs << "Couldn't locate merge tool to handle extension " << extension << " in " << specFile << '\n';
    ErrMsg(errs);
    return {};
}

std::string SubstituteMergePlaceholderFilePaths(const std::string& arguments, const std::string& base,
                                                const std::string& left, const std::string& right,
                                                const std::string& dest) {
    const std::pair<const char*, const std::string&> paths[] = {
        {"%b", base}, {"%l", left}, {"%r", right}, {"%d", dest}};
    std::string result = arguments;
    for (const auto& [placeholder, path] : paths)
        result = PutInPath(result, placeholder, OvrinToNativePath(path));
    return result;
}

ExitStatus FallbackMergeTool(const std::string& base, const std::string& left, const std::string& right,
                             const std::string& dest, const std::string& specFile) {
    if (specFile == kNoSpecFile) return ExitStatus::Failed;
    const std::string specPath = GetSpecFilename(specFile);
    const FallbackCommandMap fallbacks = PopulateFallbacks(specPath);
    if (fallbacks.empty()) return ExitStatus::Failed;
    const FallbackCommandEntry entry = GetFallbackCommandEntry(fallbacks, left, specPath);
    if (entry.path.empty()) return ExitStatus::Failed;
    const std::string arguments =
        SubstituteMergePlaceholderFilePaths(entry.arguments, base, left, right, dest);
    if (!FileExists(dest.c_str())) std::ofstream{dest};
    return RunTool(entry.path, arguments);
}
