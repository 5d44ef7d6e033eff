#include "Review/LocalPlace.h"

#include "Review/FieldNumber.h"

#include <array>
#include <limits>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

/// The fields of a Transform that say where it stands.
struct Keys {
    const YAMLScalar* position = YAMLScalar::Lookup("m_LocalPosition");
    const YAMLScalar* rotation = YAMLScalar::Lookup("m_LocalRotation");
    const YAMLScalar* scale = YAMLScalar::Lookup("m_LocalScale");
    std::array<const YAMLScalar*, 4> axes = {YAMLScalar::Lookup("x"), YAMLScalar::Lookup("y"),
                                             YAMLScalar::Lookup("z"), YAMLScalar::Lookup("w")};

    static const Keys& Known() {
        static const Keys keys;
        return keys;
    }
};

using Numbers = std::array<double, 4>;

/// Not a number for what is there and is none.
double NumberOr(const YAMLNode* value, double otherwise) {
    if (!value) return otherwise;
    const YAMLScalar* scalar = AsScalar(value);
    const std::optional<double> number = scalar ? NumberIn(scalar->Value()) : std::nullopt;
    return number.value_or(std::numeric_limits<double>::quiet_NaN());
}

Numbers NumbersIn(const YAMLNode* vector, Numbers numbers) {
    for (std::size_t i = 0; i < numbers.size(); ++i)
        numbers[i] = NumberOr(FieldOf(vector, Keys::Known().axes[i]), numbers[i]);
    return numbers;
}

/// Displacement, rotation and scale.
struct Parts {
    Numbers position = {0, 0, 0, 0}, rotation = {0, 0, 0, 1}, scale = {1, 1, 1, 1};

    Affine Frame() const {
        return Affine::Of({position[0], position[1], position[2]},
                          {rotation[0], rotation[1], rotation[2], rotation[3]},
                          {scale[0], scale[1], scale[2]});
    }
};

Parts PartsOf(const ObjectBody& transform) {
    const Keys& keys = Keys::Known();
    Parts parts;
    parts.position = NumbersIn(transform.Field(keys.position), parts.position);
    parts.rotation = NumbersIn(transform.Field(keys.rotation), parts.rotation);
    parts.scale = NumbersIn(transform.Field(keys.scale), parts.scale);
    return parts;
}

/// The number that an override such as "m_LocalPosition.x" gives, or null for any other.
double* NumberOf(Parts& parts, std::string_view property) {
    const std::size_t dot = property.find('.');
    if (dot == std::string_view::npos || dot + 2 != property.size()) return nullptr;
    const std::size_t axis = std::string_view("xyzw").find(property.back());
    if (axis == std::string_view::npos) return nullptr;
    const std::string_view field = property.substr(0, dot);
    const Keys& keys = Keys::Known();
    if (field == keys.position->Value()) return &parts.position[axis];
    if (field == keys.rotation->Value()) return &parts.rotation[axis];
    return field == keys.scale->Value() ? &parts.scale[axis] : nullptr;
}

Parts PartsOfInstance(const ObjectBody& instance) {
    Parts parts;
    Reference root;
    for (const YAMLNode* modification : ModificationsOf(instance)) {
        const Override change = OverrideOf(modification);
        double* number = change.property ? NumberOf(parts, change.property->Value()) : nullptr;
        if (!number) continue;
        if (!root.fileID) root = change.target;
        if (change.target.fileID == root.fileID && change.target.guid == root.guid)
            *number = NumberOr(change.value, *number);
    }
    return parts;
}

} // namespace

bool HasPlace(const ObjectBody& body) {
    return body.IsTransform() || body.IsPrefabInstance();
}

LocalPlace LocalPlaceOf(const ObjectBody& body) {
    if (body.IsPrefabInstance())
        return {LocalReference(FieldOf(body.Field(YAMLScalar::mModification), YAMLScalar::mTransformParent)),
                PartsOfInstance(body).Frame()};
    if (body.isStripped) return {InstanceOf(body), {}};
    return {LocalReference(body.Field(YAMLScalar::mFather)), PartsOf(body).Frame()};
}

} // namespace ovrin
