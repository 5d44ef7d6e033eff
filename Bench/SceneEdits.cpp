#include "SceneEdits.h"

#include <algorithm>
#include <cctype>

namespace ovrin_bench {
namespace {

/// Fields that nobody edits by hand, or that give a list element its identity.
bool IsFixed(const std::string& key) {
    return key == "m_Script" || key == "m_StateMachineTransitions" || key == "propertyPath" ||
           key == "target";
}

bool IsReference(const SceneValue& value) {
    return value.Find("fileID") != nullptr;
}

/// A reference within the file; changing one would need a change of the object at its other end.
bool IsLocalReference(const SceneValue& value) {
    return IsReference(value) && !value.Find("guid");
}

bool IsNumber(const std::string& text) {
    std::size_t first = text.starts_with("-") ? 1 : 0;
    return first < text.size() && std::isdigit(static_cast<unsigned char>(text[first]));
}

std::string AnyText(const std::string& like, SceneRandom& random) {
    constexpr std::uint64_t integers = 100;
    constexpr std::size_t longestName = 24;
    if (!IsNumber(like)) return like.size() > longestName ? RandomNote(random) : RandomName(random);
    bool isInteger = like.find('.') == std::string::npos;
    return isInteger ? std::to_string(random.Below(integers)) : RandomNumber(random);
}

std::string OtherText(const std::string& text, SceneRandom& random) {
    std::string other = text;
    while (other == text) other = AnyText(text, random);
    return other;
}

bool ChangeValue(SceneValue& value, SceneRandom& random);

bool ChangeEntry(SceneValue& mapping, SceneRandom& random) {
    std::size_t start = mapping.items.empty() ? 0 : random.Below(mapping.items.size());
    for (std::size_t i = 0; i < mapping.items.size(); ++i) {
        std::size_t at = (start + i) % mapping.items.size();
        if (!IsFixed(mapping.keys[at]) && ChangeValue(mapping.items[at], random)) return true;
    }
    return false;
}

SceneValue NewElementLike(const SceneValue& model, SceneRandom& random) {
    SceneValue element = model;
    if (SceneValue* target = element.Find("target")) target->Find("fileID")->text = LongID(random);
    ChangeValue(element, random);
    return element;
}

/// Whether the elements stand for objects of this file, so that the list may be reordered but nothing else.
bool ListsObjects(const SceneValue& list) {
    const SceneValue& first = list.items.front();
    return IsLocalReference(first) || first.Find("component");
}

bool MoveElement(std::vector<SceneValue>& items, SceneRandom& random) {
    std::size_t from = random.Below(items.size());
    std::size_t to = random.Below(items.size());
    if (items[from] == items[to]) return false;
    if (from < to)
        std::rotate(items.begin() + from, items.begin() + from + 1, items.begin() + to + 1);
    else
        std::rotate(items.begin() + to, items.begin() + from, items.begin() + from + 1);
    return true;
}

bool ChangeList(SceneValue& list, SceneRandom& random) {
    std::vector<SceneValue>& items = list.items;
    if (items.empty()) return false;
    if (ListsObjects(list)) return MoveElement(items, random);
    std::size_t at = random.Below(items.size());
    switch (random.Below(4)) {
    case 0: {
        SceneValue element = NewElementLike(items[at], random);
        items.insert(items.begin() + random.Below(items.size() + 1), std::move(element));
        return true;
    }
    case 1:
        items.erase(items.begin() + at);
        return true;
    case 2:
        return MoveElement(items, random);
    default:
        return ChangeValue(items[at], random);
    }
}

/// Changes something in a value, for certain if it returns true.
bool ChangeValue(SceneValue& value, SceneRandom& random) {
    if (value.kind == SceneValue::Kind::List) return ChangeList(value, random);
    if (value.kind == SceneValue::Kind::Text) {
        value.text = OtherText(value.text, random);
        return true;
    }
    if (IsLocalReference(value)) return false;
    if (!IsReference(value)) return ChangeEntry(value, random);
    value = AssetReference(random);
    return true;
}

struct TextAt {
    std::size_t field;
    std::size_t part; // in a flow mapping, else 0
};

SceneValue& At(SceneObject& object, TextAt at) {
    SceneValue& field = object.fields.items[at.field];
    return field.kind == SceneValue::Kind::Text ? field : field.items[at.part];
}

/// The scalars that can conflict by themselves: text fields, and the parts of vectors and colours.
std::vector<TextAt> ConflictPlaces(const SceneObject& object) {
    std::vector<TextAt> places;
    for (std::size_t i = 0; i < object.fields.items.size(); ++i) {
        const SceneValue& field = object.fields.items[i];
        if (field.kind == SceneValue::Kind::Text) places.push_back({i, 0});
        if (!field.flow || IsReference(field)) continue;
        for (std::size_t part = 0; part < field.items.size(); ++part) places.push_back({i, part});
    }
    return places;
}

} // namespace

std::optional<SceneConflict> SceneEditor::MakeConflict(std::size_t slotIndex) {
    SceneSlot& slot = m_Tree.slots[slotIndex];
    std::vector<TextAt> places = ConflictPlaces(slot.object);
    if (slot.claim != SceneSlot::Claim::Free || slot.object.stripped || places.empty()) return std::nullopt;
    slot.claim = SceneSlot::Claim::Conflict;
    TextAt at = m_Random.Pick(places);
    const std::string& base = At(slot.object, at).text;
    std::string& left = At(slot.Edit(Left), at).text = OtherText(base, m_Random);
    std::string& right = At(slot.Edit(Right), at).text;
    do right = OtherText(base, m_Random);
    while (right == left);

    SceneConflict conflict{slot.object.id, slot.object.className, slot.object.fields.keys[at.field]};
    const SceneValue& field = slot.object.fields.items[at.field];
    if (field.kind == SceneValue::Kind::Mapping) conflict.property += "." + field.keys[at.part];
    return conflict;
}

/// Reserves slots for one side's edit, all or none.
bool SceneEditor::Claim(const std::vector<std::size_t>& slots, Side side) {
    auto mine = side == Left ? SceneSlot::Claim::Left : SceneSlot::Claim::Right;
    for (std::size_t slot : slots)
        if (m_Tree.slots[slot].claim != SceneSlot::Claim::Free && m_Tree.slots[slot].claim != mine)
            return false;
    for (std::size_t slot : slots) m_Tree.slots[slot].claim = mine;
    return true;
}

void SceneEditor::EditStructure(Side side, std::uint64_t share) {
    m_Restructured.resize(m_Tree.entities.size());
    for (std::size_t entity = 0; entity < m_Tree.entities.size(); ++entity)
        if (m_Random.Chance(share) && !m_Restructured[entity]) RestructureEntity(entity, side);
}

void SceneEditor::RestructureEntity(std::size_t index, Side side) {
    const SceneEntity& entity = m_Tree.entities[index];
    std::size_t parentTransform = m_Tree.entities[entity.parent].transform;
    std::uint64_t edit = m_Random.Below(4);
    bool isLeaf = index != 0 && !entity.hasChildren;
    m_Restructured[index] = true;
    if (edit == 0) {
        if (Claim({entity.gameObject}, side)) AddComponent(m_Tree, index, side, m_Random, m_IDs);
    } else if (edit == 1 || !isLeaf) {
        if (Claim({entity.transform}, side)) AddChild(m_Tree, index, side, m_Random, m_IDs);
    } else if (edit == 2) {
        std::vector<std::size_t> touched = entity.components;
        touched.insert(touched.end(), {entity.gameObject, entity.transform, parentTransform});
        if (Claim(touched, side)) RemoveLeaf(m_Tree, index, side);
    } else if (Claim({entity.transform, parentTransform, m_Tree.entities[0].transform}, side)) {
        MoveToRoot(m_Tree, index, side);
    }
}

void SceneEditor::EditFieldsApart(std::uint64_t leftShare, std::uint64_t rightShare) {
    for (SceneSlot& slot : m_Tree.slots) {
        bool left = m_Random.Chance(leftShare);
        bool right = m_Random.Chance(rightShare);
        EditSlot(slot, left && slot.claim != SceneSlot::Claim::Right,
                 right && slot.claim != SceneSlot::Claim::Left);
    }
}

void SceneEditor::EditFieldsTogether(std::uint64_t share) {
    for (SceneSlot& slot : m_Tree.slots) {
        bool both = m_Random.Chance(share);
        EditSlot(slot, both, both);
    }
}

/// Deals the fields out to the sides and lets each side change some of its own.
void SceneEditor::EditSlot(SceneSlot& slot, bool left, bool right) {
    if (!slot.inBase || slot.object.stripped || slot.claim == SceneSlot::Claim::Conflict) return;
    std::vector<std::size_t> fields[2];
    std::size_t first = m_Random.Below(2);
    for (std::size_t i = 0; i < slot.object.fields.items.size(); ++i)
        if (!IsFixed(slot.object.fields.keys[i])) fields[(first++) % 2].push_back(i);
    for (Side side : {Left, Right}) {
        if (!(side == Left ? left : right) || !slot.present[side]) continue;
        SceneObject& object = slot.Edit(side);
        for (std::uint64_t edits = 1 + m_Random.Below(3); edits > 0; --edits) EditField(object, fields[side]);
    }
}

/// Changes one of the fields of an object; false if none of them can be changed.
bool SceneEditor::EditField(SceneObject& object, const std::vector<std::size_t>& fields) {
    std::size_t start = m_Random.Below(fields.size());
    for (std::size_t i = 0; i < fields.size(); ++i)
        if (ChangeValue(object.fields.items[fields[(start + i) % fields.size()]], m_Random)) return true;
    return false;
}

} // namespace ovrin_bench
