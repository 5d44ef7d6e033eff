#include "MergeInput.h"

#include "ReaderCheck.h"

#include <algorithm>
#include <vector>

namespace ovrin_fuzz {

namespace {

constexpr std::string_view kDivider = "=======\n";

std::vector<std::string_view> PartsOf(std::string_view input) {
    std::vector<std::string_view> parts;
    for (std::size_t at; parts.size() < 2 && (at = input.find(kDivider)) != input.npos;) {
        parts.push_back(input.substr(0, at));
        input.remove_prefix(at + kDivider.size());
    }
    parts.push_back(input);
    return parts;
}

std::string WithoutHeader(const std::string& text) {
    return text.starts_with(kFileHeader) ? text.substr(std::string_view(kFileHeader).size()) : text;
}

std::string WithHeader(std::string_view text) {
    return (text.starts_with("%YAML") ? "" : kFileHeader) + std::string(text);
}

std::vector<std::string> LinesOf(std::string_view text) {
    std::vector<std::string> lines;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find('\n'), text.size() - 1) + 1;
        lines.emplace_back(text.substr(0, end));
        text.remove_prefix(end);
    }
    return lines;
}

void EditLine(std::vector<std::string>& lines, unsigned kind, std::size_t at, std::size_t other, char c) {
    const auto place = lines.begin() + static_cast<std::ptrdiff_t>(at);
    std::string& line = *place;
    switch (kind) {
    case 0:
        lines.erase(place);
        break;
    case 1:
        lines.insert(place, std::string(lines[other]));
        break;
    case 2:
        std::swap(line, lines[other]);
        break;
    default:
        line.insert(line.size() - 1, 1, c);
    }
}

/// Each edit: side and kind, line, another line, character.
void Edit(std::string_view script, std::vector<std::string>& left, std::vector<std::string>& right) {
    for (; script.size() >= 4; script.remove_prefix(4)) {
        std::vector<std::string>& lines = script[0] & 1 ? right : left;
        if (lines.empty()) continue;
        const auto lineAt = [&](char c) { return static_cast<unsigned char>(c) % lines.size(); };
        EditLine(lines, script[0] >> 1 & 3, lineAt(script[1]), lineAt(script[2]), script[3]);
    }
}

std::string Joined(const std::vector<std::string>& lines) {
    std::string text;
    for (const std::string& line : lines) text += line;
    return text;
}

} // namespace

MergeTexts TextsOfInput(std::string_view input) {
    const std::vector<std::string_view> parts = PartsOf(input);
    if (parts.size() == 3) return {WithHeader(parts[0]), WithHeader(parts[1]), WithHeader(parts[2])};
    std::vector<std::string> left = LinesOf(parts[0]), right = left;
    if (parts.size() == 2) Edit(parts[1], left, right);
    return {WithHeader(parts[0]), WithHeader(Joined(left)), WithHeader(Joined(right))};
}

std::string InputOfTexts(const MergeTexts& texts) {
    std::string input;
    for (const std::string* text : {&texts.base, &texts.left, &texts.right}) {
        if (text != &texts.base) input += kDivider;
        input += WithoutHeader(*text);
        if (!input.ends_with('\n')) input += '\n';
    }
    return input;
}

} // namespace ovrin_fuzz
