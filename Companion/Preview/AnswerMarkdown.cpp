#include "Preview/AnswerMarkdown.h"

#include "Names/PrintableText.h"
#include "Preview/AnswerText.h"

#include <algorithm>

namespace ovrin {

namespace {

/// What is kept for the end: names of scenes without room, and the notes.
constexpr std::size_t kRoomForEnd = 8'000;
constexpr std::size_t kMostReport = 12'000; // bytes of a scene
constexpr std::size_t kMostWords = 500;     // characters of one line's texts

std::string OneLine(const std::string& text) {
    return ShortenedAtEnd(Printable(text), kMostWords);
}

std::size_t LongestRun(const std::string& text, char character) {
    std::size_t longest = 0, run = 0;
    for (const char each : text) longest = std::max(longest, run = each == character ? run + 1 : 0);
    return longest;
}

/// A text within a line, between more backticks than it has in a row. The blanks go when it is shown.
std::string CodeSpan(const std::string& text) {
    const std::string line = OneLine(text), ticks(LongestRun(line, '`') + 1, '`');
    return ticks + " " + line + " " + ticks;
}

/// The same between tags of HTML, where markup isn't read.
std::string HtmlCode(const std::string& text) {
    std::string escaped;
    for (const char character : OneLine(text)) {
        if (character == '&')
            escaped += "&amp;";
        else if (character == '<')
            escaped += "&lt;";
        else if (character == '>')
            escaped += "&gt;";
        else
            escaped += character;
    }
    return "<code>" + escaped + "</code>";
}

/// The beginning of a text in whole lines, and how many lines are left out.
std::string Beginning(const std::string& text, std::size_t most) {
    if (text.size() <= most) return text;
    const std::size_t end = text.rfind('\n', most);
    const std::size_t kept = end == std::string::npos ? 0 : end + 1;
    const auto left = std::count(text.begin() + static_cast<std::ptrdiff_t>(kept), text.end(), '\n');
    return text.substr(0, kept) + "... and " + Counted(static_cast<std::size_t>(left), "more line") + "\n";
}

/// A block between fences that are longer than any row of their kind in it.
std::string Block(const std::string& text) {
    const std::string fence(std::max<std::size_t>(3, LongestRun(text, '`') + 1), '`');
    return fence + "text\n" + text + (text.ends_with('\n') ? "" : "\n") + fence + "\n";
}

std::string Section(const PreviewedScene& scene) {
    const std::string words = SceneWords(scene);
    if (scene.report.empty()) return "- " + CodeSpan(scene.path) + ": " + CodeSpan(words) + "\n\n";
    return "<details><summary>" + HtmlCode(scene.path) + ": " + HtmlCode(words) + "</summary>\n\n" +
           Block(Beginning(scene.report, kMostReport)) + "\n</details>\n\n";
}

std::string Heading(const PreviewAnswer& answer) {
    const ScenesInSum sum = Sum(answer);
    std::string heading =
        "### Merging " + CodeSpan(answer.theirs.name) + " into " + CodeSpan(answer.ours.name) + ": ";
    if (answer.part.parts > 1)
        heading +=
            "part " + std::to_string(answer.part.number) + " of " + std::to_string(answer.part.parts) + ", ";
    heading += std::to_string(sum.conflicting) + " of " + Counted(sum.all, "scene") + " would conflict";
    if (sum.unknown) heading += ", of " + std::to_string(sum.unknown) + " that can't be told";
    return heading + "\n\n";
}

/// The names of scenes that got no section, as many as find room.
std::string Rest(const std::vector<const PreviewedScene*>& scenes) {
    std::string text = "No room for the conflicts of:\n\n";
    std::size_t count = 0;
    for (; count < scenes.size(); ++count) {
        const std::string line = "- " + CodeSpan(scenes[count]->path) + "\n";
        if (text.size() + line.size() > kRoomForEnd / 2) break;
        text += line;
    }
    if (count < scenes.size()) text += "- and " + Counted(scenes.size() - count, "more scene") + "\n";
    return text + "\n";
}

} // namespace

std::string ToMarkdown(const PreviewAnswer& answer) {
    std::string text = Heading(answer);
    std::vector<const PreviewedScene*> rest;
    for (const PreviewedScene& scene : answer.scenes) {
        if (!IsTold(scene)) continue;
        const std::string section = Section(scene);
        if (rest.empty() && text.size() + section.size() <= kMostMarkdown - kRoomForEnd)
            text += section;
        else
            rest.push_back(&scene);
    }
    if (!rest.empty()) text += Rest(rest);
    if (const std::string words = ByLinesWords(answer); !words.empty()) text += words + ".\n";
    return text;
}

} // namespace ovrin
