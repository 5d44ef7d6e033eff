#pragma once

#include "Values/YAMLAlloc.h"
#include "Values/YAMLNode.h"
#include "Values/YAMLScalar.h"

namespace ovrin_yaml {

class YAMLMapping;
class YAMLMappingDiff;
class YAMLSequence;
class YAMLSequenceDiff;
class YAMLSequenceRemapper;

/// One recorded difference at one place of a tree. A diff is a tree of operations; it can be printed,
/// applied, compared, copied and merged with the diff of the other side.
///
/// Operations are made through YAMLAlloc, never change once they are in a diff, are shared freely between
/// diffs and records, and live until the process ends.
class Operation {
public:
    enum class Kind { Remove, Change, Add, ChangeMapping, ChangeSequence };

    Kind GetKind() const { return m_Kind; }

    /// The change may be combined with one of the other side by descending into it. Set from the rules when
    /// the diff is made, and only acted on by the resolver.
    const bool m_Mergeable;

    /// Carries the change out on the value of `key`. Throws YAMLError where the key doesn't allow it and
    /// std::bad_cast where the value is of another kind than the operation changes.
    virtual void Apply(YAMLMapping& mapping, const YAMLScalar* key) const = 0;
    /// The same on the element at `index`, counted in the destination: positions do not shift.
    virtual void Apply(YAMLSequence& sequence, int index) const = 0;

protected:
    Operation(Kind kind, bool mergeable) : m_Mergeable(mergeable), m_Kind(kind) {}
    ~Operation() = default;

private:
    const Kind m_Kind;
};

/// An operation that brings a value. It doesn't own the value, a node of the destination tree, and gives only
/// clones of it away, so it can be applied again and again.
class ValuedOperation : public Operation {
public:
    const YAMLNode* const m_Value;

protected:
    ValuedOperation(Kind kind, const YAMLNode* value, bool mergeable)
        : Operation(kind, mergeable), m_Value(value) {}
};

/// The value goes. In a sequence it leaves a hole.
class RemoveOperation final : public Operation {
public:
    static constexpr Kind kKind = Kind::Remove;
    explicit RemoveOperation(bool mergeable) : Operation(kKind, mergeable) {}

    void Apply(YAMLMapping& mapping, const YAMLScalar* key) const override;
    void Apply(YAMLSequence& sequence, int index) const override;
};

/// The value is replaced as a whole. Such a change can never be combined with another.
class ChangeOperation final : public ValuedOperation {
public:
    static constexpr Kind kKind = Kind::Change;
    explicit ChangeOperation(const YAMLNode* value) : ValuedOperation(kKind, value, false) {}

    void Apply(YAMLMapping& mapping, const YAMLScalar* key) const override;
    void Apply(YAMLSequence& sequence, int index) const override;
};

/// A value appears. In a sequence it takes its place without shifting the others.
class AddOperation final : public ValuedOperation {
public:
    static constexpr Kind kKind = Kind::Add;
    AddOperation(const YAMLNode* value, bool mergeable) : ValuedOperation(kKind, value, mergeable) {}

    void Apply(YAMLMapping& mapping, const YAMLScalar* key) const override;
    void Apply(YAMLSequence& sequence, int index) const override;
};

/// A mapping changes inside.
class ChangeMappingOperation final : public Operation {
public:
    static constexpr Kind kKind = Kind::ChangeMapping;
    ChangeMappingOperation(const YAMLMappingDiff* diff, bool mergeable)
        : Operation(kKind, mergeable), m_Diff(diff) {}

    const YAMLMappingDiff* const m_Diff;

    void Apply(YAMLMapping& mapping, const YAMLScalar* key) const override;
    void Apply(YAMLSequence& sequence, int index) const override;
    /// As Apply. Returns the value, changed.
    YAMLMapping& Change(YAMLMapping& mapping, const YAMLScalar* key) const;
};

/// A sequence changes inside: first its elements are brought into their new places by the remapper, then the
/// operations of the diff, whose indexes are destination indexes, are carried out in ascending order.
class ChangeSequenceOperation final : public Operation {
public:
    static constexpr Kind kKind = Kind::ChangeSequence;
    ChangeSequenceOperation(const YAMLSequenceDiff* diff, const YAMLSequenceRemapper* remapper,
                            bool mergeable)
        : Operation(kKind, mergeable), m_Remapper(remapper), m_Diff(diff) {}

    const YAMLSequenceRemapper* const m_Remapper; // null where all elements stay in place
    const YAMLSequenceDiff* const m_Diff;         // never null

    void Apply(YAMLMapping& mapping, const YAMLScalar* key) const override;
    void Apply(YAMLSequence& sequence, int index) const override;

private:
    void ApplyTo(YAMLSequence& sequence) const;
};

/// The operation as a T, or null if it is null or another kind of operation.
template <class T> const T* As(const Operation* operation) {
    return operation && operation->GetKind() == T::kKind ? static_cast<const T*>(operation) : nullptr;
}

} // namespace ovrin_yaml
