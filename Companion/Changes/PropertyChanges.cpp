#include "Changes/PropertyChanges.h"

#include "Changes/ListMoves.h"
#include "Names/ReferenceText.h"
#include "Names/ValueText.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Diff/YAMLSequenceRemapper.h"

#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

const YAMLNode* ItemAt(const YAMLNode* list, int index) {
    const auto items = ItemsOf(list);
    const auto at = static_cast<std::size_t>(index);
    return index >= 0 && at < items.size() ? items[at] : nullptr;
}

/// The destination index of each element of a list; -1 for one that is gone, or that another took the place
/// of.
std::vector<int> Targets(const YAMLSequenceRemapper* remapper, std::size_t count) {
    std::vector<int> targets(count);
    for (std::size_t i = 0; i < count; ++i) targets[i] = remapper ? remapper->Target(i) : static_cast<int>(i);
    if (!remapper) return targets;
    std::vector<int> origins(remapper->m_DestinationCount, -1);
    for (std::size_t i = count; i-- > 0;) {
        if (targets[i] < 0) continue;
        int& origin = origins[static_cast<std::size_t>(targets[i])];
        if (origin < 0)
            origin = static_cast<int>(i);
        else
            targets[i] = -1;
    }
    return targets;
}

} // namespace

PropertyChanges::PropertyChanges(const ObjectNames& before, const ObjectNames& after, const MergeRules& rules,
                                 std::size_t width)
    : m_Before(before), m_After(after), m_PropertiesBefore(before, rules), m_PropertiesAfter(after, rules),
      m_Width(width) {}

std::vector<PropertyChange> PropertyChanges::List(ID id, const Operation& operation,
                                                  const IsToldElsewhere& isToldElsewhere) {
    m_IsToldElsewhere = &isToldElsewhere;
    m_Path = {id};
    m_Place.clear();
    m_Found.clear();
    Walk(operation, m_Before.Find(id), m_After.Find(id));
    return std::move(m_Found);
}

std::vector<PropertyChange> PropertyChanges::Fields(ID id, ChangeKind kind) {
    const bool isAdded = kind == ChangeKind::Added;
    const ObjectBody body = BodyOf((isAdded ? m_After : m_Before).Find(id));
    const YAMLMapping* fields = AsMapping(body.fields);
    m_Path = {id, body.className};
    m_Place.clear();
    m_Found.clear();
    if (!fields) return {};
    for (const YAMLMapping::Entry field : fields->RawEntries())
        if (field.key)
            IntoKey(field.key,
                    [&] { Tell(kind, isAdded ? nullptr : field.value, isAdded ? field.value : nullptr); });
    return std::move(m_Found);
}

/// References are values between which a line has an arrow of its own.
std::string PropertyChanges::Text(const YAMLNode* value, const ObjectNames& names) const {
    constexpr std::string_view kArrow = "→ ";
    if (!value) return {};
    std::string text = ValueLine(*value, names, m_Width);
    return IsReference(*value) && text.starts_with(kArrow) ? text.substr(kArrow.size()) : text;
}

void PropertyChanges::Tell(ChangeKind kind, const Node* before, const Node* after) {
    m_Found.push_back({m_Place, kind, Text(before, m_Before), Text(after, m_After)});
}

void PropertyChanges::IntoKey(ID key, const std::function<void()>& visit) {
    const std::size_t size = m_Place.size();
    const bool isClass = m_Path.size() == 1;
    m_Path.push_back(key);
    if (!isClass) AddKey(m_Place, key);
    visit();
    m_Path.pop_back();
    m_Place.resize(size);
}

void PropertyChanges::IntoElement(const PropertyNames& properties, const Node* list, int index,
                                  const std::function<void()>& visit) {
    const std::size_t size = m_Place.size();
    const YAMLScalar* number = IndexScalar(index);
    AddElement(m_Place, properties.ElementName(m_Path, list, ItemAt(list, index), number));
    m_Path.push_back(number);
    visit();
    m_Path.pop_back();
    m_Place.resize(size);
}

void PropertyChanges::Walk(const Operation& operation, const Node* before, const Node* after) {
    const bool isReference = before && after && IsReference(*before) && IsReference(*after);
    switch (operation.GetKind()) {
    case Operation::Kind::Add:
        return Tell(ChangeKind::Added, nullptr, after);
    case Operation::Kind::Remove:
        return Tell(ChangeKind::Removed, before, nullptr);
    case Operation::Kind::Change:
        return Tell(ChangeKind::Changed, before, after);
    case Operation::Kind::ChangeMapping:
        if (isReference) return Tell(ChangeKind::Changed, before, after);
        return WalkMapping(*As<ChangeMappingOperation>(&operation), before, after);
    case Operation::Kind::ChangeSequence:
        return WalkList(*As<ChangeSequenceOperation>(&operation), before, after);
    }
}

void PropertyChanges::WalkMapping(const ChangeMappingOperation& change, const Node* before,
                                  const Node* after) {
    for (const auto& [key, operation] : change.m_Diff->Entries())
        IntoKey(key, [&, key = key, operation = operation] {
            Walk(*operation, FieldOf(before, key), FieldOf(after, key));
        });
    const ChangeSequenceOperation* order = change.m_Diff->m_KeyOrder;
    if (!order || !order->m_Remapper || FindMoved(order->m_Remapper->m_Mapping).empty()) return;
    const std::string place = m_Place.empty() ? "(order of the fields)" : m_Place + " (order of the fields)";
    m_Found.push_back({place, ChangeKind::Changed, "", ""});
}

void PropertyChanges::WalkList(const ChangeSequenceOperation& change, const Node* before, const Node* after) {
    const std::vector<int> targets = Targets(change.m_Remapper, ItemsOf(before).size());
    std::vector<int> origins(ItemsOf(after).size(), -1);
    for (std::size_t i = 0; i < targets.size(); ++i) {
        const auto target = static_cast<std::size_t>(targets[i]);
        if (targets[i] < 0)
            TellElement(ChangeKind::Removed, before, static_cast<int>(i));
        else if (target < origins.size())
            origins[target] = static_cast<int>(i);
    }
    TellMoves(targets, after);
    for (const auto& [index, operation] : change.m_Diff->Entries()) {
        if (As<AddOperation>(operation)) {
            TellElement(ChangeKind::Added, after, index);
            continue;
        }
        const auto at = static_cast<std::size_t>(index);
        const Node* former = at < origins.size() ? ItemAt(before, origins[at]) : nullptr;
        IntoElement(m_PropertiesAfter, after, index, [&, operation = operation, index = index] {
            Walk(*operation, former, ItemAt(after, index));
        });
    }
}

void PropertyChanges::TellMoves(const std::vector<int>& targets, const Node* after) {
    for (const std::size_t moved : FindMoved(targets))
        IntoElement(m_PropertiesAfter, after, targets[moved], [&] {
            m_Found.push_back(
                {m_Place, ChangeKind::Moved, std::to_string(moved), std::to_string(targets[moved])});
        });
}

void PropertyChanges::TellElement(ChangeKind kind, const Node* list, int index) {
    const Node* item = ItemAt(list, index);
    if ((*m_IsToldElsewhere)(m_Path.back(), item)) return;
    const bool isAdded = kind == ChangeKind::Added;
    IntoElement(isAdded ? m_PropertiesAfter : m_PropertiesBefore, list, index,
                [&] { Tell(kind, isAdded ? nullptr : item, isAdded ? item : nullptr); });
}

} // namespace ovrin
