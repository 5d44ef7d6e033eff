#include "Preview/AnswerText.h"

#include "Names/PrintableText.h"

namespace ovrin {

namespace {

constexpr std::size_t kNamesInSummary = 5;

std::string NamesOf(const PreviewAnswer& answer, Verdict verdict) {
    std::string names;
    std::size_t count = 0;
    for (const PreviewedScene& scene : answer.scenes) {
        if (scene.verdict != verdict || ++count > kNamesInSummary) continue;
        names += (names.empty() ? ": " : ", ") + Printable(scene.path);
    }
    if (count > kNamesInSummary) names += " and " + std::to_string(count - kNamesInSummary) + " more";
    return names;
}

/// The lines of a text, each with blanks in front.
std::string Indented(const std::string& text) {
    std::string lines;
    for (std::size_t from = 0; from < text.size();) {
        const std::size_t end = std::min(text.find('\n', from), text.size());
        lines += end > from ? "    " + text.substr(from, end - from) + "\n" : "\n";
        from = end + 1;
    }
    return lines;
}

} // namespace

std::string Counted(std::size_t count, const std::string& thing) {
    return std::to_string(count) + " " + thing + (count == 1 ? "" : "s");
}

std::string SummaryLine(const PreviewAnswer& answer) {
    const ScenesInSum sum = Sum(answer);
    const bool isPart = answer.part.parts > 1;
    std::string line;
    if (isPart)
        line = "Part " + std::to_string(answer.part.number) + " of " + std::to_string(answer.part.parts) +
               ": " + std::to_string(sum.all) + " of ";
    line += Counted(isPart ? answer.count : sum.all, "scene") + " changed on both sides, " +
            (sum.conflicting ? std::to_string(sum.conflicting) : "none") + " would conflict" +
            NamesOf(answer, Verdict::Conflicts);
    if (sum.unknown)
        line +=
            "; of " + std::to_string(sum.unknown) + " that can't be told" + NamesOf(answer, Verdict::Unknown);
    return line;
}

bool IsTold(const PreviewedScene& scene) {
    return scene.verdict != Verdict::Clean || !scene.isByObjects;
}

std::string SceneWords(const PreviewedScene& scene) {
    std::string words = scene.problem;
    const auto add = [&](const std::string& more) { words += (words.empty() ? "" : "; ") + more; };
    if (!scene.conflicts.empty()) add(Counted(scene.conflicts.size(), "conflict"));
    if (!scene.isByObjects) add("git would merge it by lines");
    return words;
}

std::string ToText(const PreviewAnswer& answer) {
    std::string text;
    for (const PreviewedScene& scene : answer.scenes) {
        if (!IsTold(scene)) continue;
        text += Printable(scene.path) + ": " + SceneWords(scene) + "\n";
        if (!scene.report.empty()) text += Indented(scene.report) + "\n";
    }
    if (!text.empty() && !text.ends_with("\n\n")) text += "\n";
    return text + SummaryLine(answer) + "\n";
}

std::string ByLinesWords(const PreviewAnswer& answer) {
    const std::size_t count = Sum(answer).byLines;
    if (!count) return {};
    return Counted(count, "scene") + (count == 1 ? " has" : " have") +
           " no attribute merge=ovrin: git would merge by lines what is told here by objects. "
           "\"ovrin setup\" is the cure";
}

} // namespace ovrin
