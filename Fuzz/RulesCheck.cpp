#include "SmallChecks.h"

#include "Diff/MergeRules.h"
#include "Diff/RulesReader.h"

#include <cstdio>
#include <sstream>
#include <stdexcept>
#include <vector>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

/// A path without elements can be written: as a dot.
std::string Written(const Path& path) {
    std::string text;
    for (const YAMLScalar* element : path) (text += element->Value()) += '.';
    return " " + (text.empty() ? "." : text);
}

std::string Written(const std::vector<Path>& paths) {
    std::string text;
    for (const Path& path : paths) text += Written(path);
    return text;
}

std::string Written(float number) {
    char text[32];
    std::snprintf(text, sizeof text, " %.9g", static_cast<double>(number));
    return text;
}

/// As a rules file.
std::string Written(const MergeRules& rules) {
    std::string text = "[arrays]\n";
    for (const SequenceInfo& rule : rules.ListRules())
        text += (rule.list.kind == SequenceType::Set ? "set" : "plain") + Written(rule.path) +
                Written(rule.list.keys) + "\n";
    text += "[exclusions]\n";
    for (const ExclusionInfo& rule : rules.Exclusions())
        text += (rule.mergeable ? "include" : "exclude") + Written(rule.path) + "\n";
    for (const ExclusionInfo& rule : rules.ConditionalExclusions())
        text += (rule.mergeable ? "includeIfContains" : "excludeIfContains") + Written(rule.path) +
                Written(rule.fieldPaths) + "\n";
    text += "[comparisons]\n";
    for (const auto& [path, tolerance] : rules.Comparisons())
        text += "float" + Written(path) + Written(tolerance.relative) + Written(tolerance.absolute) + "\n";
    return text + (rules.CheckBlankPremergeBaseEnabled() ? "[premerge]\nlegacyBlankPremergeBase\n" : "");
}

struct Reading {
    std::string failure; // empty: none
    std::string rules;
};

Reading Read(const std::string& text) {
    Reading reading;
    MergeRules rules;
    std::istringstream stream(text);
    try {
        LoadSequenceUniqueKeys(stream, rules);
    } catch (const std::runtime_error& error) {
        reading.failure = error.what();
    }
    reading.rules = Written(rules);
    return reading;
}

/// The number at the end of a failure; 0 if there is none.
unsigned long LineOf(const std::string& failure) {
    const std::size_t at = failure.rfind("at line ");
    return at == failure.npos ? 0 : std::strtoul(failure.c_str() + at + 8, nullptr, 10);
}

std::string FirstLines(const std::string& text, unsigned long count) {
    std::size_t end = 0;
    for (; count > 0 && end < text.size(); --count) end = std::min(text.find('\n', end), text.size() - 1) + 1;
    return text.substr(0, end);
}

std::string CheckFailure(const std::string& text, const Reading& reading) {
    const unsigned long line = LineOf(reading.failure);
    if (line == 0) return "a failure without a line: " + reading.failure;
    const Reading above = Read(FirstLines(text, line - 1));
    if (!above.failure.empty()) return "a bad line ahead of the first: " + above.failure;
    if (above.rules != reading.rules) return "rules of a bad line stay: " + reading.rules;
    const Reading upTo = Read(FirstLines(text, line));
    return upTo.failure == reading.failure ? "" : "another failure without the lines below: " + upTo.failure;
}

} // namespace

std::string CheckRules(std::string_view input) {
    const std::string text(input);
    const Reading reading = Read(text);
    std::string finding = reading.failure.empty() ? "" : CheckFailure(text, reading);
    const Reading again = Read(reading.rules);
    if (finding.empty() && (!again.failure.empty() || again.rules != reading.rules))
        finding = "rules\n" + reading.rules + "are read as\n" + again.rules + again.failure;
    return finding;
}

} // namespace ovrin_fuzz
