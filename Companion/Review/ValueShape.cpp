#include "Review/ValueShape.h"

#include "Names/ReferenceText.h"
#include "Review/FieldNumber.h"

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <algorithm>
#include <string_view>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

/// Whether the keys of a mapping are these letters, in their order, `atLeast` of them.
bool AreKeys(const YAMLMapping& mapping, std::string_view letters, std::size_t atLeast) {
    std::size_t count = 0;
    for (const YAMLMapping::Entry entry : mapping) {
        const bool fits = count < letters.size() && entry.key->Value() == letters.substr(count, 1);
        if (!fits || !AsScalar(entry.value)) return false;
        ++count;
    }
    return count >= atLeast;
}

bool AreSameFields(const YAMLMapping& one, const YAMLMapping& other) {
    const YAMLMapping::Pairs left = one.RawEntries(), right = other.RawEntries();
    std::size_t at = 0;
    for (const YAMLMapping::Entry entry : left) {
        if (!entry.key) continue;
        while (at < right.size() && !right[at].key) ++at;
        if (at == right.size() || right[at].key != entry.key || !IsSameValue(right[at].value, entry.value))
            return false;
        ++at;
    }
    while (at < right.size() && !right[at].key) ++at;
    return at == right.size();
}

} // namespace

const char* ShapeName(ValueShape shape) {
    static constexpr const char* kNames[] = {"number",    "text", "colour", "vector",
                                             "reference", "list", "other",  "other"};
    return kNames[static_cast<std::size_t>(shape)];
}

ValueShape ShapeOf(const YAMLNode& value) {
    if (const YAMLScalar* scalar = AsScalar(&value))
        return NumberIn(scalar->Value()) ? ValueShape::Number : ValueShape::Text;
    const YAMLMapping* mapping = AsMapping(&value);
    if (!mapping) return ValueShape::List;
    if (mapping->HasDuplicates()) return ValueShape::Other;
    if (IsReference(value)) return ValueShape::Reference;
    if (AreKeys(*mapping, "rgba", 3)) return ValueShape::Colour;
    return AreKeys(*mapping, "xyzw", 2) ? ValueShape::Vector : ValueShape::Fields;
}

ValueShape CommonShape(std::span<const YAMLNode* const> values) {
    std::optional<ValueShape> common;
    const auto isScalar = [](ValueShape shape) {
        return shape == ValueShape::Number || shape == ValueShape::Text;
    };
    for (const YAMLNode* value : values) {
        if (!value) continue;
        const ValueShape shape = ShapeOf(*value);
        if (common && *common != shape)
            common = isScalar(*common) && isScalar(shape) ? ValueShape::Text : ValueShape::Other;
        else
            common = shape;
    }
    return common.value_or(ValueShape::Other);
}

std::vector<double> NumbersOf(const YAMLNode& value) {
    std::vector<double> numbers;
    const auto add = [&](const YAMLNode* node) {
        const YAMLScalar* scalar = AsScalar(node);
        const std::optional<double> number = scalar ? NumberIn(scalar->Value()) : std::nullopt;
        if (number) numbers.push_back(*number);
        return number.has_value();
    };
    const YAMLMapping* mapping = AsMapping(&value);
    if (!mapping) {
        add(&value);
        return numbers;
    }
    for (const YAMLMapping::Entry entry : mapping->RawEntries())
        if (entry.key && !add(entry.value)) return {};
    return numbers;
}

bool IsSameValue(const YAMLNode* one, const YAMLNode* other) {
    if (one == other) return true;
    if (!one || !other || one->GetKind() != other->GetKind()) return false;
    if (const YAMLMapping* mapping = AsMapping(one)) return AreSameFields(*mapping, *AsMapping(other));
    const YAMLSequence* list = AsSequence(one);
    if (!list) return false; // scalars of one text are one
    return std::ranges::equal(list->m_Items, AsSequence(other)->m_Items, IsSameValue);
}

} // namespace ovrin
