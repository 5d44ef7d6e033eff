#include "SmallChecks.h"

#include "CapturedStreams.h"
#include "Fallback.h"

#include <sys/mman.h>
#include <unistd.h>

#include <algorithm>
#include <sstream>

namespace ovrin_fuzz {

namespace {

constexpr const char* kModes[] = {"use", "use-on-conflict", "use-second-pass"};

/// A file in memory, that can be opened by its path.
class MemoryFile {
public:
    explicit MemoryFile(const std::string& text) : m_File(memfd_create("input", 0)) {
        if (write(m_File, text.data(), text.size()) != static_cast<ssize_t>(text.size())) std::abort();
    }
    ~MemoryFile() { close(m_File); }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    std::string Path() const { return "/proc/self/fd/" + std::to_string(m_File); }

private:
    const int m_File;
};

struct Reading {
    FallbackCommandMap tools;
    unsigned long badLine = 0; // 0: none
};

Reading Read(const std::string& text) {
    const MemoryFile file(text);
    const CapturedStreams streams;
    Reading reading{PopulateFallbacks(file.Path())};
    const std::string& errors = streams.LastErrors();
    // Messages of earlier files may stand in front.
    const std::size_t at = errors.rfind("' on line ");
    if (at != errors.npos) reading.badLine = std::strtoul(errors.c_str() + at + 10, nullptr, 10);
    return reading;
}

/// The lines that name tools, up to the bad one.
std::vector<std::string> ToolLines(const std::string& text, unsigned long badLine) {
    std::vector<std::string> lines;
    std::istringstream stream(text);
    std::string line;
    for (unsigned long number = 1; number != badLine && std::getline(stream, line); ++number)
        if (!line.empty() && line[0] != '#') lines.push_back(line);
    return lines;
}

std::string Line(const std::string& extension, const FallbackCommandEntry& tool) {
    return extension + " " + kModes[tool.mode] + " \"" + tool.path + "\" " + tool.arguments + "\n";
}

std::string Written(const FallbackCommandMap& tools) {
    std::string text;
    for (const auto& [extension, entries] : tools)
        for (const FallbackCommandEntry& entry : entries) text += Line(extension, entry);
    return text;
}

/// Whether a tool may stand in a line.
bool IsOf(const std::string& line, const std::string& extension, const FallbackCommandEntry& tool) {
    const bool isPathThere = line.find(tool.path) != line.npos || line.find("%programs%") != line.npos;
    return line.starts_with(extension) && line.find(kModes[tool.mode]) != line.npos && isPathThere &&
           line.ends_with(tool.arguments);
}

/// Whether "%programs%" stands in the path of a line, its first quoted text behind extension and mode.
bool HasPrograms(const std::string& line) {
    const std::size_t mode = line.find_first_not_of(" \t", line.find_first_of(" \t"));
    const std::size_t open = line.find('"', line.find_first_of(" \t", mode));
    const std::size_t close = open == line.npos ? open : line.find('"', open + 1);
    return close != line.npos && line.substr(open, close - open).find("%programs%") != line.npos;
}

/// Each tool against the next line of its extension; %programs% makes two tools of one line.
std::string CheckLines(const FallbackCommandMap& tools, const std::vector<std::string>& lines) {
    std::size_t counted = 0;
    for (const auto& [extension, entries] : tools) {
        auto entry = entries.begin();
        for (const std::string& line : lines) {
            if (line.substr(0, line.find_first_of(" \t")) != extension) continue;
            ++counted;
            for (int left = HasPrograms(line) ? 2 : 1; left > 0; --left, ++entry)
                if (entry == entries.end() || !IsOf(line, extension, *entry))
                    return "no tool of line " + line;
        }
        if (entry != entries.end()) return "a tool of no line: " + Line(extension, *entry);
    }
    return counted == lines.size() ? "" : "a line without a tool";
}

} // namespace

std::string CheckMergeSpec(std::string_view input) {
    const std::string text(input);
    const Reading reading = Read(text);
    std::string finding = CheckLines(reading.tools, ToolLines(text, reading.badLine));
    const std::string written = Written(reading.tools);
    if (finding.empty() && Written(Read(written).tools) != written) finding = "read otherwise: " + written;
    for (const auto& [extension, entries] : reading.tools)
        for (const FallbackCommandEntry& entry : entries) {
            const std::string call =
                SubstituteMergePlaceholderFilePaths(entry.arguments, "/B", "/L", "/R", "/D");
            for (const char* placeholder : {"%b", "%l", "%r", "%d"})
                if (call.find(placeholder) != call.npos) finding = "a placeholder stays: " + call;
        }
    return finding;
}

} // namespace ovrin_fuzz
