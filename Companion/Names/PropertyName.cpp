#include "Names/PropertyName.h"

#include "Names/ObjectLabel.h"
#include "Names/PrintableText.h"

#include <charconv>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

constexpr std::size_t kElementWidth = 60;

bool IsIndex(const YAMLScalar* key) {
    const std::string_view text = key->Value();
    return !text.empty() && text.find_first_not_of("0123456789") == std::string_view::npos;
}

const YAMLNode* ItemAt(const YAMLNode* list, const YAMLScalar* index) {
    const std::span<YAMLNode* const> items = ItemsOf(list);
    const std::string_view text = index->Value();
    std::size_t at = 0;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), at);
    return error == std::errc() && end == text.data() + text.size() && at < items.size() ? items[at]
                                                                                         : nullptr;
}

/// The value at the end of a rule's field path, or null.
const YAMLNode* FieldAt(const YAMLNode* item, const Path& fieldPath) {
    try {
        return MergeRules::GetYAMLNodeFieldByPath(item, fieldPath);
    } catch (const YAMLError&) { // of repeated keys
        return nullptr;
    }
}

} // namespace

void AddKey(std::string& place, const YAMLScalar* key) {
    if (!place.empty()) place += '.';
    place += ShortenedInMiddle(Printable(key->Value()), kElementWidth);
}

void AddElement(std::string& place, const std::string& element) {
    place += '[' + element + ']';
}

std::size_t PropertyNames::TargetHash::operator()(const Target& target) const {
    const std::hash<ID> hash;
    return hash(target.first) * 31 + hash(target.second);
}

std::string PropertyNames::Name(std::span<const ID> path) const {
    if (path.empty()) return {};
    const ObjectBody body = BodyOf(m_Names.Find(path[0]));
    std::string place;
    const bool hasClass = path.size() > 1 && path[1] == body.className;
    const YAMLNode* node = hasClass ? body.fields : m_Names.Find(path[0]);
    for (std::size_t i = hasClass ? 2 : 1; i < path.size(); ++i) {
        if (AsSequence(node)) {
            const YAMLNode* item = ItemAt(node, path[i]);
            AddElement(place, ElementName(path.first(i), node, item, path[i]));
            node = item;
        } else if (!node && IsIndex(path[i])) {
            AddElement(place, std::string(path[i]->Value()));
        } else {
            AddKey(place, path[i]);
            node = FieldOf(node, path[i]);
        }
    }
    return place;
}

std::string PropertyNames::ElementName(std::span<const ID> listPath, const YAMLNode* list,
                                       const YAMLNode* item, ID index) const {
    const ListRule& rule = m_Rules.SelectKeyPaths(Path(listPath.begin(), listPath.end()));
    std::string name;
    for (const Path& key : rule.keys) {
        const std::string part = KeyName(listPath.front(), list, item, key);
        if (part.empty()) return Printable(index->Value());
        name += (name.empty() ? "" : " · ") + part;
    }
    return name.empty() ? Printable(index->Value()) : name;
}

/// The value of one of an item's keys; empty if it has none.
std::string PropertyNames::KeyName(ID owner, const YAMLNode* list, const YAMLNode* item,
                                   const Path& key) const {
    const YAMLScalar* value = AsScalar(FieldAt(item, key));
    if (!value) return {};
    if (key.empty() || key.back() != YAMLScalar::fileID)
        return ShortenedInMiddle(Printable(value->Value()), kElementWidth);
    return ReferenceName(owner, list, ReferenceOf(FieldAt(item, Path(key.begin(), key.end() - 1))));
}

/// Transforms are told by the GameObject alone, since lists of children are read as lists of these; what
/// belongs to the owner of the list by what it is.
std::string PropertyNames::ReferenceName(ID owner, const YAMLNode* list, const Reference& reference) const {
    const std::string id = Printable(reference.fileID->Value());
    if (reference.guid) {
        const TargetNames& targets = NamesWithin(list);
        const auto found = targets.find({reference.fileID, reference.guid});
        return found == targets.end() ? ShortGuid(reference.guid) + " " + id : found->second;
    }
    if (reference.IsNone()) return "none";
    if (!m_Names.Has(reference.fileID)) return MissingLabel(reference.fileID);
    ObjectNames::Parts parts = m_Names.NameOf(reference.fileID);
    if (!parts.part.empty() && m_Names.Above(reference.fileID) == owner)
        parts.place = std::exchange(parts.part, "");
    const bool isTransform = BodyOf(m_Names.Find(reference.fileID)).IsTransform();
    return isTransform ? parts.place : parts.Text();
}

const PropertyNames::TargetNames& PropertyNames::NamesWithin(const YAMLNode* list) const {
    const auto [found, isNew] = m_TargetNames.try_emplace(list);
    if (!isNew) return found->second;
    for (const YAMLNode* item : ItemsOf(list)) {
        const Override change = OverrideOf(item);
        if (change.IsName() && change.target.fileID)
            found->second.try_emplace({change.target.fileID, change.target.guid},
                                      OwnName(AsScalar(change.value)));
    }
    return found->second;
}

} // namespace ovrin
