#include "Conflicts/Conflict.h"

#include "Conflicts/DecisionPath.h"
#include "Conflicts/Requirements.h"
#include "Names/PrintableText.h"
#include "Names/ValueText.h"

#include "Diff/YAMLMappingDiff.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <numeric>

namespace ovrin {

using namespace ovrin_yaml;
using nlohmann::json;

namespace {

constexpr Side kSides[] = {Side::Base, Side::Ours, Side::Theirs};

Version VersionOf(Side side) {
    return side == Side::Base ? Version::Base : side == Side::Ours ? Version::Ours : Version::Theirs;
}

struct KindWords {
    const char* code;
    const char* text;
};

/// In the order of ConflictKind.
constexpr KindWords kKindWords[] = {
    {"both-changed", "both changed it"},
    {"both-added", "both added it"},
    {"theirs-removed", "theirs removed it and ours changed it"},
    {"parent-loop", "both moved objects, which are now below each other"},
    {"broken-requirement", "one side removed what is needed still"},
    {"key-order", "both changed the order in which fields are written"},
};

const Operation* ChangeOn(const MergeSession::Record& record, Side side) {
    return side == Side::Ours ? record.right : side == Side::Theirs ? record.left : nullptr;
}

/// The fields of an object that an operation on it touches: "m_Layer, m_Name", shortened.
std::string TouchedFields(const Operation& operation) {
    constexpr std::size_t kWidth = 60;
    std::string fields;
    const auto* object = As<ChangeMappingOperation>(&operation);
    if (!object) return fields;
    for (const auto& [className, change] : object->m_Diff->Entries()) {
        const auto* body = As<ChangeMappingOperation>(change);
        if (!body) continue;
        for (const auto& [field, inner] : body->m_Diff->Entries())
            fields += (fields.empty() ? "" : ", ") + std::string(field->Value());
    }
    return ShortenedAtEnd(Printable(fields), kWidth);
}

json ToJson(const YAMLNode* value) {
    if (const YAMLScalar* scalar = AsScalar(value)) return std::string(scalar->Value());
    if (const YAMLSequence* sequence = AsSequence(value)) {
        json items = json::array();
        for (const YAMLNode* item : sequence->m_Items) items.push_back(ToJson(item));
        return items;
    }
    json fields = json::object();
    if (const YAMLMapping* mapping = AsMapping(value))
        for (const auto& [key, field] : *mapping)
            if (!IsPlaceHolderKey(key)) fields[std::string(key->Value())] = ToJson(field);
    return fields;
}

} // namespace

const char* WhatHappened(ConflictKind kind) {
    return kKindWords[static_cast<std::size_t>(kind)].text;
}

const char* CodeOf(ConflictKind kind) {
    return kKindWords[static_cast<std::size_t>(kind)].code;
}

std::string ObjectWords(const Operation* operation, const YAMLNode* value) {
    if (!value) return As<RemoveOperation>(operation) ? "removed" : "none";
    if (!operation) return "kept";
    if (As<AddOperation>(operation)) return "added";
    const std::string fields = TouchedFields(*operation);
    return fields.empty() ? "changed" : "changed " + fields;
}

ConflictWords::ConflictWords(SceneMerge& merge, std::size_t width, MergeNames::Words versions)
    : m_Merge(merge), m_Width(width), m_Names(merge.Session(), std::move(versions)),
      m_Places(merge.Session(), m_Names) {}

Conflict ConflictWords::Describe(const OpenConflict& open) const {
    Conflict conflict{};
    conflict.path = DecisionPath(open.path);
    conflict.kind = open.kind;
    if (open.kind != ConflictKind::KeyOrder) {
        conflict.id = open.path.front()->Value();
        conflict.object = m_Names.Name(open.path.front());
        conflict.heading = m_Names.NameWithID(open.path.front());
    }
    const RecordPlace place = m_Places.Find(open.record);
    conflict.property = place.property;
    for (const Side side : kSides) {
        const auto at = static_cast<std::size_t>(side);
        conflict.values[at] = place.In(VersionOf(side));
        conflict.words[at] = ValueWords(open, conflict, side);
        conflict.choices[at] = ChoiceWords(open, conflict, side);
    }
    return conflict;
}

std::string ConflictWords::ValueWords(const OpenConflict& open, const Conflict& conflict, Side side) const {
    const YAMLNode* value = conflict.In(side);
    if (open.path.size() < 3) {
        if (side == Side::Base) return value ? "there" : "none";
        return ObjectWords(ChangeOn(open.record, side), value);
    }
    if (value) return ValueLine(*value, m_Names.In(VersionOf(side)), m_Width);
    return side != Side::Base && conflict.In(Side::Base) ? "removed" : "none";
}

std::string ConflictWords::ChoiceWords(const OpenConflict& open, const Conflict& conflict, Side side) const {
    const YAMLNode* value = conflict.In(side);
    if (open.kind == ConflictKind::KeyOrder) return std::string("the order of ") + SideName(side);
    if (open.kind == ConflictKind::BrokenRequirement) return RequirementChoice(open, side);
    if (open.kind == ConflictKind::ParentLoop) {
        const ObjectNames& names = m_Names.In(VersionOf(side));
        const YAMLScalar* parent = LocalReference(value);
        if (!parent) return "at the top";
        const YAMLScalar* place = names.Places().PlaceIDOf(names.Places().Body(parent), parent);
        return "below " + names.Name(place ? place : parent);
    }
    if (!value) return conflict.In(Side::Base) ? "remove it" : "leave it out";
    return std::string(open.path.size() < 3 ? "keep that of " : "take ") + SideName(side);
}

std::string ConflictWords::RequirementChoice(const OpenConflict& open, Side side) const {
    const YAMLScalar* id = open.path.front();
    const std::string name = m_Names.Name(id);
    if (m_Names.Has(VersionOf(side), id)) return "keep " + name;
    const bool isNeeded = !NeededBy(m_Merge.Session(), id, side).empty();
    return "remove " + name + (isNeeded ? " and what needs it" : "");
}

std::vector<Conflict> ConflictWords::DescribeOpen(std::size_t most) const {
    const std::vector<OpenConflict>& open = m_Merge.Open();
    std::vector<MergeNames::ID> ids;
    ids.reserve(open.size());
    for (const OpenConflict& conflict : open) ids.push_back(conflict.path.front());
    const std::vector<std::uint32_t> ranks = m_Names.Ranks(ids);
    std::vector<std::size_t> order(open.size());
    std::iota(order.begin(), order.end(), std::size_t{0});
    std::ranges::stable_sort(order, {}, [&](std::size_t at) { return ranks[at]; });
    if (most && order.size() > most) order.resize(most);
    std::vector<Conflict> conflicts;
    conflicts.reserve(order.size());
    for (const std::size_t at : order) conflicts.push_back(Describe(open[at]));
    return conflicts;
}

json ToJson(const Conflict& conflict) {
    json written = {{"path", conflict.path},
                    {"kind", CodeOf(conflict.kind)},
                    {"object", nullptr},
                    {"property", conflict.property}};
    if (!conflict.id.empty()) written["object"] = {{"id", conflict.id}, {"name", conflict.object}};
    for (const Side side : kSides) {
        written["choices"][SideName(side)] = conflict.ChoiceOf(side);
        json& version = written[SideName(side)];
        if (const YAMLNode* value = conflict.In(side))
            version = {{"value", ToJson(value)}, {"text", conflict.WordsOf(side)}};
    }
    return written;
}

} // namespace ovrin
