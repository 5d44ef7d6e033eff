#include "Settle/Terminal/SideTexts.h"

#include "Names/ValueLines.h"
#include "Settle/Terminal/TextDifference.h"

#include "Values/YAMLMapping.h"

#include <algorithm>
#include <string>

namespace ovrin {

namespace {

using Ranges = std::vector<TextRange>;

constexpr Side kSides[] = {Side::Base, Side::Ours, Side::Theirs};

/// What a side did, or what it comes to take it, where its value doesn't say that.
std::string WhatIsDone(const Conflict& conflict, Side side) {
    const bool isChoice =
        conflict.kind == ConflictKind::ParentLoop || conflict.kind == ConflictKind::BrokenRequirement;
    if (isChoice) return conflict.ChoiceOf(side);
    return !conflict.In(side) || conflict.property.empty() ? conflict.WordsOf(side) : "";
}

/// A value as a text of several lines; empty where there is none.
std::string TextOfValue(const Conflict& conflict, Side side, const MergeNames& names,
                        const Letters& letters) {
    std::string text;
    const ovrin_yaml::YAMLNode* value = conflict.In(side);
    if (!value) return text;
    // One that takes a line stands in words already.
    const ovrin_yaml::YAMLScalar* scalar = ovrin_yaml::AsScalar(value);
    if (scalar && scalar->Value().find('\n') == std::string_view::npos)
        return letters.Shown(conflict.WordsOf(side));
    for (const std::string& line : ValueLines(*value, names.In(VersionOf(side))))
        text += (text.empty() ? "" : "\n") + letters.Shown(line);
    return text;
}

/// Ranges of both, in order and without overlap.
Ranges Joined(const Ranges& a, const Ranges& b) {
    Ranges all = a, joined;
    all.insert(all.end(), b.begin(), b.end());
    std::ranges::sort(all, {}, &TextRange::begin);
    for (const TextRange& range : all) {
        if (joined.empty() || joined.back().end < range.begin)
            joined.push_back(range);
        else
            joined.back().end = std::max(joined.back().end, range.end);
    }
    return joined;
}

/// The lines of a text whose marked parts stand out.
SideText Marked(const std::string& text, const Ranges& marks, std::size_t columns) {
    SideText side;
    auto mark = marks.begin();
    for (std::size_t begin = 0; begin <= text.size();) {
        const std::size_t end = std::min(text.find('\n', begin), text.size());
        StyledLine line;
        for (std::size_t at = begin; at < end;) {
            while (mark != marks.end() && mark->end <= at) ++mark;
            const bool isMarked = mark != marks.end() && mark->begin <= at;
            const std::size_t to = mark == marks.end() ? end : isMarked ? mark->end : mark->begin;
            line.push_back(
                {text.substr(at, std::min(to, end) - at), isMarked ? Style::Difference : Style::Plain});
            at = std::min(to, end);
        }
        for (StyledLine& wrapped : Wrapped(line, columns)) side.lines.push_back(std::move(wrapped));
        begin = end + 1;
    }
    const auto first = std::ranges::find_if(side.lines, [](const StyledLine& line) {
        return std::ranges::any_of(line,
                                   [](const StyledSpan& span) { return span.style == Style::Difference; });
    });
    if (first != side.lines.end())
        side.firstDifference = static_cast<std::size_t>(first - side.lines.begin());
    return side;
}

/// The parts of a side's text that others lack, of those that have any.
Ranges MarksOf(const Conflict& conflict, Side side, const std::array<std::string, 3>& texts) {
    Ranges marks;
    const auto compare = [&](Side other) {
        if (conflict.In(other))
            marks = Joined(marks, PartsNotIn(texts[static_cast<std::size_t>(side)],
                                             texts[static_cast<std::size_t>(other)]));
    };
    if (side == Side::Base) {
        compare(Side::Ours);
        compare(Side::Theirs);
    } else {
        compare(conflict.In(Side::Base) ? Side::Base : side == Side::Ours ? Side::Theirs : Side::Ours);
    }
    return marks;
}

/// The names of the objects of one version that the other lacks.
std::vector<std::string> ObjectsNotIn(const ObjectNames& names, const ObjectNames& other) {
    std::vector<std::string> objects;
    for (const auto& [id, object] : names.Places().Root())
        if (!other.Has(id)) objects.push_back(names.Name(id));
    return objects;
}

} // namespace

std::array<SideText, 3> SideTextsOf(const Walk& walk, const Walk::Stop& stop, const Letters& letters,
                                    std::size_t columns) {
    const Conflict& conflict = walk.WordsOf(stop);
    std::array<std::string, 3> texts;
    for (const Side side : kSides)
        texts[static_cast<std::size_t>(side)] =
            TextOfValue(conflict, side, walk.SceneOf(stop).Names(), letters);
    std::array<SideText, 3> sides;
    for (const Side side : kSides) {
        const auto at = static_cast<std::size_t>(side);
        if (conflict.In(side)) sides[at] = Marked(texts[at], MarksOf(conflict, side, texts), columns);
        if (const std::string what = WhatIsDone(conflict, side); !what.empty())
            sides[at].what = {{letters.Shown(what), Style::Strong}};
    }
    return sides;
}

std::array<SideText, 3> AddedObjectsOf(const Walk& walk, const Walk::Stop& stop, const Letters& letters,
                                       std::size_t columns) {
    const MergeNames& names = walk.SceneOf(stop).Names();
    std::array<SideText, 3> sides;
    sides[0].what = {
        {walk.SceneOf(stop).Source().isBothAdded ? "no such scene" : "what both began with", Style::Strong}};
    for (const Side side : {Side::Ours, Side::Theirs}) {
        const Side other = side == Side::Ours ? Side::Theirs : Side::Ours;
        std::vector<StyledLine>& lines = sides[static_cast<std::size_t>(side)].lines;
        const auto objects = ObjectsNotIn(names.In(VersionOf(side)), names.In(VersionOf(other)));
        sides[static_cast<std::size_t>(side)].what = {
            {std::to_string(objects.size()) + (objects.size() == 1 ? " object" : " objects") + " of its own",
             Style::Strong}};
        for (const std::string& name : objects)
            for (StyledLine& wrapped : Wrapped({{letters.Shown(name)}}, columns))
                lines.push_back(std::move(wrapped));
    }
    return sides;
}

} // namespace ovrin
