#include "Settle/Terminal/KeyTable.h"

#include <algorithm>
#include <iterator>

namespace ovrin {

namespace {

constexpr Key kNone{};

/// In the order in which they are shown.
constexpr KeyEntry kKeys[] = {
    {Request::NextOpen, {KeyOf('n'), Key::Tab}, "n", "Next", "the next open conflict", true},
    {Request::PreviousOpen, {KeyOf('p'), Key::BackTab}, "p", "Previous", "the previous one", true},
    {Request::Ours, {KeyOf('o')}, "o", "Ours", "take ours here, and go to the next open conflict", true},
    {Request::Theirs, {KeyOf('t')}, "t", "Theirs", "take theirs", true},
    {Request::Base, {KeyOf('b')}, "b", "Base", "take what was there before both changed it", true},
    {Request::WholeOurs,
     {KeyOf('O')},
     "O T B",
     "Whole object",
     "take ours, theirs or base for all that is open about this object and what stands under it",
     true},
    {Request::WholeTheirs, {KeyOf('T')}, nullptr, nullptr, nullptr, true},
    {Request::WholeBase, {KeyOf('B')}, nullptr, nullptr, nullptr, true},
    {Request::All,
     {KeyOf('a')},
     "a",
     "All open",
     "take one side for all that is open, in all scenes; o, t or b says which",
     true},
    {Request::Proposed,
     {KeyOf('g')},
     "g",
     "As before",
     "take what you decided of the same values before, wherever that is proposed",
     true},
    {Request::Remedy,
     {kNone},
     "1-9",
     "Mend",
     "do what is offered under that number, where something is missing",
     true},
    {Request::Undo, {KeyOf('u')}, "u", "Undo", "take the last step back", true},
    {Request::Redo, {KeyOf('r')}, "r", "Redo", "make it again", true},
    {Request::Search,
     {KeyOf('/')},
     "/",
     "Search",
     "find an object or a property by a part of its name; without a text the next one of the last search",
     true},
    {Request::Help, {KeyOf('?'), KeyOf('h')}, "?", "Help", "this", true},
    {Request::Finish,
     {KeyOf('f')},
     "f",
     "Finish",
     "put the settled scenes in place and tell version control",
     true},
    {Request::Leave,
     {KeyOf('q')},
     "q",
     "Leave",
     "stop here; what you decided is kept, and \"ovrin settle\" goes on",
     true},
    {Request::Up, {Key::Up, KeyOf('k')}, "↑ ↓", nullptr, "up and down in the list, also k and j", false},
    {Request::Down, {Key::Down, KeyOf('j')}, nullptr, nullptr, nullptr, false},
    {Request::First, {Key::Home}, "Home End", nullptr, "to its first and last line", false},
    {Request::Last, {Key::End}, nullptr, nullptr, nullptr, false},
    {Request::SideBefore, {Key::Left}, "← →", nullptr, "choose a side, which Enter takes", false},
    {Request::SideBehind, {Key::Right}, nullptr, nullptr, nullptr, false},
    {Request::Confirm,
     {Key::Enter},
     "Enter",
     nullptr,
     "take the side that is chosen or proposed; finish when all is settled",
     false},
    {Request::ViewOn,
     {Key::PageDown, KeyOf('v'), KeyOf(' ')},
     "v",
     nullptr,
     "see more of long values, also Page Down",
     true},
    {Request::ViewBack, {Key::PageUp, KeyOf('V')}, "V", nullptr, "go back in them, also Page Up", false},
};

constexpr std::size_t kHelpColumn = 12;

} // namespace

std::span<const KeyEntry> KeyTable() {
    return kKeys;
}

std::optional<Request> RequestOf(Key key) {
    if (key >= KeyOf('1') && key <= KeyOf('9')) return Request::Remedy;
    for (const KeyEntry& entry : kKeys)
        if (key != kNone && std::ranges::find(entry.keys, key) != entry.keys.end()) return entry.request;
    return {};
}

bool IsForPrompts(Request request) {
    const auto* entry = std::ranges::find(kKeys, request, &KeyEntry::request);
    return entry != std::end(kKeys) && entry->isForPrompts;
}

std::optional<Side> SideOf(Request request) {
    switch (request) {
    case Request::Ours:
    case Request::WholeOurs:
        return Side::Ours;
    case Request::Theirs:
    case Request::WholeTheirs:
        return Side::Theirs;
    case Request::Base:
    case Request::WholeBase:
        return Side::Base;
    default:
        return {};
    }
}

std::optional<Side> SideOf(Key key) {
    for (const Side side : {Side::Base, Side::Ours, Side::Theirs})
        if (key == KeyOf(LetterOf(side))) return side;
    return {};
}

char LetterOf(Side side) {
    return *SideName(side);
}

std::vector<StyledLine> KeyLines(std::size_t columns, const Letters& letters) {
    std::vector<StyledLine> lines(1);
    std::size_t used = 0;
    for (const KeyEntry& entry : kKeys) {
        if (!entry.label) continue;
        const StyledLine told = {{" " + letters.Shown(entry.shown), Style::Key},
                                 {std::string(" ") + entry.label + " ", Style::Plain}};
        if (used + ColumnsOf(told) > columns && used > 0) {
            lines.emplace_back();
            used = 0;
        }
        used += ColumnsOf(told);
        Append(lines.back(), told);
    }
    return lines;
}

std::vector<StyledLine> HelpLines(std::size_t columns, const Letters& letters, bool isForPrompts) {
    std::vector<StyledLine> lines;
    for (const KeyEntry& entry : kKeys) {
        if (!entry.shown || (isForPrompts && !entry.isForPrompts)) continue;
        StyledLine head = Fitted({{"  " + letters.Shown(entry.shown), Style::Key}}, kHelpColumn);
        for (const StyledLine& words :
             Wrapped({{letters.Shown(entry.help)}}, columns - std::min(columns - 1, kHelpColumn))) {
            Append(head, words);
            lines.push_back(std::move(head));
            head = {{std::string(kHelpColumn, ' ')}};
        }
    }
    return lines;
}

} // namespace ovrin
