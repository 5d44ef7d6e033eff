#include "Changes/ChangeMarkdown.h"

#include "Names/PrintableText.h"
#include "Words/Markdown.h"

namespace ovrin {

namespace {

std::string FileLine(const FilePair& file) {
    std::string text = "### " + CodeSpan(Printable(file.newPath));
    switch (file.status) {
    case FileStatus::Added:
        return text + ", added\n\n";
    case FileStatus::Removed:
        return text + ", removed\n\n";
    case FileStatus::Renamed:
        return text + ", renamed from " + CodeSpan(Printable(file.oldPath)) + "\n\n";
    case FileStatus::Copied:
        return text + ", copied from " + CodeSpan(Printable(file.oldPath)) + "\n\n";
    case FileStatus::Unmerged:
        return text + ", not merged yet\n\n";
    default:
        return text + "\n\n";
    }
}

std::string PropertyLine(const PropertyChange& change) {
    const std::string place = change.place.empty() ? "the whole object" : CodeSpan(change.place);
    switch (change.kind) {
    case ChangeKind::Added:
        return "  - " + place + ": added " + CodeSpan(change.after) + "\n";
    case ChangeKind::Removed:
        return "  - " + place + ": removed " + CodeSpan(change.before) + "\n";
    case ChangeKind::Moved:
        return "  - " + place + ": moved from index " + change.before + " to " + change.after + "\n";
    default:
        if (change.before.empty() && change.after.empty()) return "  - " + place + ": changed\n";
        return "  - " + place + ": " + CodeSpan(change.before) + " → " + CodeSpan(change.after) + "\n";
    }
}

std::string ObjectLines(const ObjectChange& change) {
    static constexpr const char* kWords[] = {"added", "removed", "changed", "moved"};
    std::string text = "- **" + std::string(kWords[static_cast<std::size_t>(change.kind)]) + "** " +
                       CodeSpan(change.name + " (" + change.id + ")");
    if (change.isMoved)
        text += std::string(change.kind == ChangeKind::Moved ? ", from " : ", moved from ") +
                (change.formerParent.empty() ? "the top" : CodeSpan(change.formerParent));
    text += '\n';
    for (const PropertyChange& property : change.properties) text += PropertyLine(property);
    return text;
}

} // namespace

std::string ChangeMarkdown(std::span<const FileChange> changes) {
    std::string text;
    std::size_t others = 0;
    for (const FileChange& change : changes) {
        if (!change.scene && change.reason.empty() && change.file.status != FileStatus::Unmerged) {
            ++others;
            continue;
        }
        text += FileLine(change.file);
        if (!change.reason.empty()) text += "Can't be compared by objects: " + CodeSpan(change.reason) + "\n";
        if (change.scene) {
            for (const ObjectChange& object : change.scene->objects) text += ObjectLines(object);
            if (change.scene->objects.empty()) text += "No object differs.\n";
        }
        text += '\n';
    }
    if (text.empty()) text = "No scene differs.\n\n";
    if (others)
        text += std::to_string(others) + (others == 1 ? " other file differs.\n" : " other files differ.\n");
    return text;
}

} // namespace ovrin
