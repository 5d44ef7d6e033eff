#include "Setup/ProgramCall.h"

#include "Systems/Process.h"

#include "FileUtils.h"

#include <algorithm>
#include <array>
#include <filesystem>

namespace ovrin {

namespace {

namespace fs = std::filesystem;

constexpr const char* kProgram = "ovrin";

bool IsSearchedByAll(const fs::path& folder) {
    constexpr std::array<std::string_view, 3> kFolders = {"/usr/local/bin", "/usr/bin", "/bin"};
    return std::ranges::find(kFolders, folder.string()) != kFolders.end();
}

bool IsPlain(char character) {
    constexpr std::string_view kOthers = "/._-+,:@";
    return std::isalnum(static_cast<unsigned char>(character)) ||
           kOthers.find(character) != std::string_view::npos;
}

} // namespace

std::string ProgramCall::ForShell() const {
    return ShellWord(name);
}

std::string ProgramCall::ForSubversion() const {
    return name + "-svn";
}

ProgramCall CallOfThisProgram(const std::string& name) {
    if (!name.empty()) return {name};
    const std::string folder = GetDataFilesDir(), itself = folder + kProgram;
    // An installation has a link in a folder of programs, beside that by which Subversion calls us.
    for (const std::string& place : {FindProgram(kProgram), folder + "../../bin/" + kProgram}) {
        std::error_code error;
        if (place.empty() || !fs::equivalent(place, itself, error)) continue;
        const fs::path path = fs::absolute(place).lexically_normal();
        return {IsSearchedByAll(path.parent_path()) ? kProgram : path.string()};
    }
    return {itself};
}

std::string ShellWord(const std::string& word) {
    if (!word.empty() && std::ranges::all_of(word, IsPlain)) return word;
    std::string quoted = "'";
    for (const char character : word) {
        if (character == '\'')
            quoted += "'\\''";
        else
            quoted += character;
    }
    return quoted + '\'';
}

} // namespace ovrin
