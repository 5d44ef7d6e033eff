#include "Changes/ChangeText.h"

#include "Names/PrintableText.h"

#include <algorithm>

namespace ovrin {

namespace {

/// What terminals know as colours.
constexpr const char* kBold = "1";
constexpr const char* kGreen = "32";
constexpr const char* kRed = "31";
constexpr const char* kYellow = "33";
constexpr const char* kCyan = "36";

class Painter {
public:
    explicit Painter(bool inColour) : m_InColour(inColour) {}

    std::string operator()(const char* colour, const std::string& text) const {
        return m_InColour && !text.empty() ? "\033[" + std::string(colour) + "m" + text + "\033[m" : text;
    }

private:
    const bool m_InColour;
};

const char* ColourOf(ChangeKind kind) {
    switch (kind) {
    case ChangeKind::Added:
        return kGreen;
    case ChangeKind::Removed:
        return kRed;
    case ChangeKind::Moved:
        return kCyan;
    default:
        return kYellow;
    }
}

/// As wide as the widest of them.
const char* PaddedWord(ChangeKind kind) {
    static constexpr const char* kWords[] = {"added  ", "removed", "changed", "moved  "};
    return kWords[static_cast<std::size_t>(kind)];
}

std::string PropertyLine(const PropertyChange& change, const Painter& paint) {
    const std::string place = change.place.empty() ? "(the whole object)" : change.place;
    const std::string head = "             " + place;
    switch (change.kind) {
    case ChangeKind::Added:
        return head + ": " + paint(kGreen, "added") + " " + change.after + "\n";
    case ChangeKind::Removed:
        return head + ": " + paint(kRed, "removed") + " " + change.before + "\n";
    case ChangeKind::Moved:
        return head + ": " + paint(kCyan, "moved") + " from index " + change.before + " to " + change.after +
               "\n";
    default:
        if (change.before.empty() && change.after.empty()) return head + ": changed\n";
        return head + ": " + paint(kRed, change.before) + " → " + paint(kGreen, change.after) + "\n";
    }
}

std::string ObjectLines(const ObjectChange& change, const Painter& paint) {
    std::string text = "  " + paint(ColourOf(change.kind), PaddedWord(change.kind)) + "  " +
                       paint(kBold, change.name) + " (" + change.id + ")";
    if (change.isMoved)
        text += (change.kind == ChangeKind::Moved ? ", from " : ", moved from ") +
                (change.formerParent.empty() ? "the top" : change.formerParent);
    text += '\n';
    for (const PropertyChange& property : change.properties) text += PropertyLine(property, paint);
    return text;
}

/// "1 added, 2 changed"; nothing is told of what there is nothing of.
std::string Counts(const SceneChange& scene) {
    std::string text;
    const auto add = [&](std::size_t count, const char* word) {
        if (count) text += (text.empty() ? "" : ", ") + std::to_string(count) + " " + word;
    };
    add(scene.added, "added");
    add(scene.removed, "removed");
    add(scene.changed, "changed");
    add(scene.moved, "moved");
    return text.empty() ? "no object differs" : text;
}

} // namespace

std::string StatusText(const FilePair& file) {
    switch (file.status) {
    case FileStatus::Added:
        return "added";
    case FileStatus::Removed:
        return "removed";
    case FileStatus::Renamed:
        return "renamed from " + Printable(file.oldPath);
    case FileStatus::Copied:
        return "copied from " + Printable(file.oldPath);
    case FileStatus::Unmerged:
        return "not merged yet: \"ovrin status\" tells what is open";
    default:
        return file.oldPath == file.newPath ? "" : "compared with " + Printable(file.oldPath);
    }
}

std::string PaintedLines(const std::string& lines, bool inColour) {
    const Painter paint(inColour);
    std::string text;
    for (std::size_t at = 0; at < lines.size();) {
        const std::size_t end = std::min(lines.find('\n', at), lines.size());
        const std::string line = lines.substr(at, end - at);
        const char* colour = line.starts_with("+++") || line.starts_with("---") ? kBold
                             : line.starts_with('+')                            ? kGreen
                             : line.starts_with('-')                            ? kRed
                             : line.starts_with("@@")                           ? kCyan
                                                                                : nullptr;
        text += colour ? paint(colour, line) : line;
        text += '\n';
        at = end + 1;
    }
    return text;
}

std::string ChangeText(const FileChange& change, bool inColour) {
    const Painter paint(inColour);
    const std::string status = StatusText(change.file);
    std::string text =
        paint(kBold, Printable(change.file.newPath)) + (status.empty() ? "" : ", " + status) + "\n";
    if (!change.reason.empty())
        text += "  by lines, since it can't be compared by objects: " + change.reason + "\n";
    if (!change.scene) return text + PaintedLines(change.lines, inColour);
    for (const ObjectChange& object : change.scene->objects) text += ObjectLines(object, paint);
    if (change.scene->objects.empty()) text += "  no object differs\n";
    return text;
}

std::string ChangeStat(std::span<const FileChange> changes, bool inColour) {
    const Painter paint(inColour);
    std::size_t width = 0, scenes = 0;
    for (const FileChange& change : changes)
        width = std::max(width, CharacterCount(Printable(change.file.newPath)));
    SceneChange sum;
    std::string text;
    for (const FileChange& change : changes) {
        const std::string path = Printable(change.file.newPath), status = StatusText(change.file);
        text += " " + paint(kBold, path) + std::string(width - CharacterCount(path), ' ') + " | ";
        text += change.scene            ? Counts(*change.scene)
                : change.reason.empty() ? "no scene"
                                        : "can't be compared by objects";
        text += (status.empty() ? "" : " (" + status + ")") + "\n";
        if (!change.scene) continue;
        ++scenes;
        sum.added += change.scene->added;
        sum.removed += change.scene->removed;
        sum.changed += change.scene->changed;
        sum.moved += change.scene->moved;
    }
    if (changes.empty()) return text;
    return text + " " + std::to_string(scenes) + (scenes == 1 ? " scene: " : " scenes: ") + Counts(sum) +
           "\n";
}

} // namespace ovrin
