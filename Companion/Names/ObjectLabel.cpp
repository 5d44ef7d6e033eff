#include "Names/ObjectLabel.h"

#include "Names/PrintableText.h"

namespace ovrin {

using namespace ovrin_yaml;

namespace {

constexpr std::size_t kLabelWidth = 80;
constexpr std::size_t kGuidLetters = 8;

const YAMLScalar* NameKey() {
    static const YAMLScalar* const key = YAMLScalar::Lookup("m_Name");
    return key;
}

bool IsBlank(const YAMLScalar* text) {
    return !text || text->Value().find_first_not_of(" \t\r\n") == std::string_view::npos;
}

std::string Bounded(const YAMLScalar* text) {
    return ShortenedInMiddle(Printable(text->Value()), kLabelWidth);
}

/// The first name that an instance gives to one of its objects: mostly its root's, which editors always
/// write.
const YAMLScalar* NameAmongModifications(const ObjectBody& instance) {
    for (const YAMLNode* modification : ModificationsOf(instance))
        if (const Override change = OverrideOf(modification); change.IsName()) return AsScalar(change.value);
    return nullptr;
}

/// The guid of the first field that refers to another file.
const YAMLScalar* SourceGuid(const ObjectBody& instance) {
    const YAMLMapping* fields = AsMapping(instance.fields);
    if (!fields) return nullptr;
    for (const YAMLMapping::Entry field : fields->RawEntries())
        if (const YAMLScalar* guid = field.key ? ReferenceOf(field.value).guid : nullptr) return guid;
    return nullptr;
}

std::string ClassName(const ObjectBody& body) {
    return body.className ? Bounded(body.className) : "(no class)";
}

std::string WithGuid(const ObjectBody& body, const YAMLScalar* guid) {
    return guid ? ClassName(body) + " " + ShortGuid(guid) : ClassName(body);
}

} // namespace

std::string OwnName(const YAMLScalar* name) {
    return IsBlank(name) ? "(no name)" : Bounded(name);
}

std::string ShortGuid(const YAMLScalar* guid) {
    return std::string(FirstCharacters(Printable(guid->Value().substr(0, 4 * kGuidLetters)), kGuidLetters));
}

std::string ClassLabel(const ObjectBody& body) {
    return WithGuid(body, ReferenceOf(body.Field(YAMLScalar::mScript)).guid);
}

std::string PlaceLabel(const ObjectBody& body) {
    if (!body.IsPrefabInstance()) return OwnName(AsScalar(body.Field(NameKey())));
    const YAMLScalar* name = NameAmongModifications(body);
    return IsBlank(name) ? WithGuid(body, SourceGuid(body)) : Bounded(name);
}

std::string PlainLabel(const ObjectBody& body) {
    const YAMLScalar* name = AsScalar(body.Field(NameKey()));
    return IsBlank(name) ? ClassLabel(body) : ClassLabel(body) + " " + Bounded(name);
}

std::string MissingLabel(const YAMLScalar* id) {
    return "(missing " + Bounded(id) + ")";
}

} // namespace ovrin
