#pragma once

#include "Values/YAMLNode.h"

#include <string_view>
#include <vector>

namespace ovrin_yaml {

/// A text. There is exactly one object per distinct text in the process, so two scalars are equal if and only
/// if they are the same object. Quoting and type are not part of it: a quoted 1 and a plain 1 are one scalar,
/// 1 and 1.0 are two. m_Hash is the MurmurHash3 of the text.
class YAMLScalar final : public YAMLNode {
public:
    static constexpr Kind kKind = Kind::Scalar;

    /// The one scalar of `text`, made if new; never null. May be called from any thread at any time; a text
    /// that is known already is found without a lock. `line` is kept if the scalar is made by this call.
    /// Throws YAMLError "Scalar is too long" for a text of 4 GiB or more.
    static YAMLScalar* Lookup(std::string_view text, std::uint32_t line = 0);

    /// Interns the well-known scalars below. Called once, by `initialize`, before anything else is used.
    static void initializeConstants();

    /// The text, which stands right behind the object.
    std::string_view Value() const { return {reinterpret_cast<const char*>(this + 1), m_Length}; }

    /// Room for what a writer finds out about the text, so that it need not be looked at again; 0: nothing
    /// yet. All who write it must mean the same, since any thread may.
    std::uint8_t WriterMemo() const { return __atomic_load_n(&m_WriterMemo, __ATOMIC_RELAXED); }
    void SetWriterMemo(std::uint8_t memo) const { __atomic_store_n(&m_WriterMemo, memo, __ATOMIC_RELAXED); }

    /// The text as a decimal number as a stream in the "C" locale reads it: what does not begin with a number
    /// is 0, what stands behind the number is ignored, and what is out of range is the nearest limit.
    int GetIntValue() const;
    float GetFloatValue() const;

    void Free() {}
    YAMLNode* Clone() const { return const_cast<YAMLScalar*>(this); }
    bool Equals(const YAMLNode* other) const { return this == other; }
    bool EqualsExpensive(const YAMLNode* other) const { return this == other; }
    void RebuildHash(bool) {}

    static YAMLScalar* const null;
    static YAMLScalar* underscore;
    static YAMLScalar* empty;
    static YAMLScalar* zero;
    static YAMLScalar* one;
    static YAMLScalar* monoBehaviour;
    static YAMLScalar* mScript;
    static YAMLScalar* mFather;
    static YAMLScalar* transform;
    static YAMLScalar* rectTransform;
    static YAMLScalar* fileID;
    static YAMLScalar* star;
    static YAMLScalar* prefab;
    static YAMLScalar* prefabInstance;
    static YAMLScalar* mModification;
    static YAMLScalar* mTransformParent;
    static YAMLScalar* mPrefabInstance;
    static YAMLScalar* mPrefabInternal;
    static YAMLScalar* mPrefab;
    static YAMLScalar* guid;
    static YAMLScalar* fileIDPlaceHolderName;
    static YAMLScalar* classIDPlaceHolderName;
    static YAMLScalar* strippedPrefabPlaceHolderName;
    static YAMLScalar* mergeTypeInfo;
    static YAMLScalar* mergeTypeInfoPersistentTypeID;
    static YAMLScalar* mergeTypeInfoTypeName;
    static YAMLScalar* mergeTypeInfoIsMultiInstance;
    static YAMLScalar* mergeTypeInfoBasePersistentTypeID;
    static YAMLScalar* mergeTypeInfoRequires;
    static YAMLScalar* mergeTypeInfoConflicts;
    static YAMLScalar* gameObject;
    static YAMLScalar* mComponent;
    static YAMLScalar* mGameObject;

private:
    friend class ScalarTable;

    YAMLScalar(std::uint32_t length, std::uint32_t hash, std::uint32_t line)
        : YAMLNode(Kind::Scalar), m_Length(length) {
        m_Hash = hash;
        m_Line = line;
    }

    mutable std::uint8_t m_WriterMemo = 0;
    const std::uint32_t m_Length;
};

inline YAMLScalar* AsScalar(YAMLNode* node) {
    return NodeAs<YAMLScalar>(node);
}
inline const YAMLScalar* AsScalar(const YAMLNode* node) {
    return NodeAs<const YAMLScalar>(node);
}

/// Makes the library ready: interns the well-known scalars. Call it once, before anything else of the
/// library.
void initialize();

/// The place of a property: mapping keys and, for sequence elements, the decimal text of the index. Elements
/// are compared by address. As text they are joined by ".".
using Path = std::vector<const YAMLScalar*>;

/// Decimal text of a value that is not negative.
std::string IntToString(int value);

/// The interned decimal text of a sequence index, as it stands in a path.
const YAMLScalar* IndexScalar(int index);

} // namespace ovrin_yaml
