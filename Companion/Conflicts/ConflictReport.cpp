#include "Conflicts/ConflictReport.h"

#include "Names/PrintableText.h"

#include <algorithm>
#include <nlohmann/json.hpp>

namespace ovrin {

namespace {

constexpr std::size_t kValueWidth = 60;
constexpr Side kSides[] = {Side::Base, Side::Ours, Side::Theirs};

/// Where a choice isn't one between values it says more than they do.
const std::string& WordsFor(const Conflict& conflict, Side side) {
    const bool isChoice =
        conflict.kind == ConflictKind::ParentLoop || conflict.kind == ConflictKind::BrokenRequirement;
    return isChoice ? conflict.ChoiceOf(side) : conflict.WordsOf(side);
}

/// "        ours    5    main", where the labels of all three values stand in one column.
std::string TellValue(const Conflict& conflict, Side side, const std::string& label, std::size_t width) {
    const std::string& words = WordsFor(conflict, side);
    std::string line = std::string(4, ' ') + SideName(side);
    line.resize(4 + sizeof("theirs  ") - 1, ' ');
    line += words;
    if (!label.empty()) line += std::string(width - CharacterCount(words) + 4, ' ') + Printable(label);
    return line + '\n';
}

/// What the sides are in an action beyond their labels.
struct Roles {
    const char* action;
    const char* ours;
    const char* theirs;
};

constexpr Roles kRoles[] = {
    {"rebase", "what you rebase onto", "your own commit, which is put on top of it"},
    {"cherry-pick", "what you have checked out", "the commit that you pick"},
    {"revert", "what you have checked out", "what stood there before the commit that you revert"},
    {"stash", "what you have checked out", "what you had put aside"},
    {"am", "what you have checked out", "what the patch makes of its base"},
    {"graft", "what you have checked out", "the changeset that you graft"},
    {"unshelve", "what you have checked out", "what you had put aside"},
};

std::string TellSide(Side side, const std::string& label, const char* role) {
    return SideName(side) + std::string(" is ") + (label.empty() ? "" : Printable(label) + ", ") + role;
}

} // namespace

std::string TellConflict(const Conflict& conflict, const SideLabels& labels) {
    std::string text = "  " + (conflict.property.empty() ? "" : conflict.property + ": ");
    text += std::string(WhatHappened(conflict.kind)) + '\n';
    std::size_t width = 0;
    for (const Side side : kSides) width = std::max(width, CharacterCount(WordsFor(conflict, side)));
    for (const Side side : kSides) text += TellValue(conflict, side, labels.Of(side), width);
    return text;
}

std::string TellSides(const Occasion& occasion) {
    for (const Roles& roles : kRoles)
        if (occasion.action == roles.action)
            return TellSide(Side::Ours, occasion.ours, roles.ours) + "; " +
                   TellSide(Side::Theirs, occasion.theirs, roles.theirs) + '\n';
    return {};
}

std::string TellConflicts(SceneMerge& merge, const SideLabels& labels, std::size_t most) {
    const ConflictWords words(merge, kValueWidth);
    std::string text, heading;
    const std::vector<Conflict> conflicts = words.DescribeOpen(most);
    for (const Conflict& conflict : conflicts) {
        if (conflict.heading != heading) text += (heading = conflict.heading) + '\n';
        text += TellConflict(conflict, labels);
    }
    const std::size_t rest = merge.Open().size() - conflicts.size();
    if (rest) text += "and " + std::to_string(rest) + " more\n";
    return text;
}

nlohmann::json ConflictsToJson(SceneMerge& merge) {
    nlohmann::json conflicts = nlohmann::json::array();
    for (const Conflict& conflict : ConflictWords(merge).DescribeOpen())
        conflicts.push_back(ToJson(conflict));
    return {{"bothAdded", merge.IsBothAdded()},
            {"open", merge.Open().size()},
            {"conflicts", std::move(conflicts)}};
}

std::string CountOpen(std::size_t count) {
    return std::to_string(count) + (count == 1 ? " open conflict" : " open conflicts");
}

} // namespace ovrin
