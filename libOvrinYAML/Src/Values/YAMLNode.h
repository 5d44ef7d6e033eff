#pragma once

#include <cstdint>

namespace ovrin_yaml {

class YAMLScalar;
class YAMLMapping;
class YAMLSequence;

/// Double dispatch over a value tree. `Accept` only dispatches; descending is the visitor's own business.
class YAMLNodeVisitor {
public:
    virtual void Visit(const YAMLScalar&) = 0;
    virtual void Visit(YAMLMapping&) = 0;
    virtual void Visit(YAMLSequence&) = 0;

protected:
    ~YAMLNodeVisitor() = default;
};

/// A value of a document: scalar, mapping or sequence.
///
/// Mappings and sequences belong to exactly one tree, which one thread uses at a time, and are released with
/// `Free`, never by deletion. Scalars are interned: one object per text in the process, owned by nobody,
/// immutable, shared by all threads; `Free` does nothing to them and `Clone` returns the scalar itself, so
/// that code treats all values alike. What a node can do depends on its kind; there are millions of nodes, so
/// the kind is a byte, where virtual functions would cost each a pointer.
class YAMLNode {
public:
    enum class Kind : std::uint8_t { Scalar, Mapping, Sequence };

    /// Content hash. 0 means that no hash is known, and is also the hash of an empty container. It goes stale
    /// when a container is changed; only the reader and pre-processing build it. Of an object that is unbuilt
    /// (YAMLMapping) it is unknown.
    std::uint32_t m_Hash = 0;
    /// Zero-based line of the node's start in the text its document was parsed from. Of a scalar, which
    /// stands in many places, the place where its text was first met.
    std::uint32_t m_Line = 0;

    Kind GetKind() const { return m_Kind; }

    /// Gives the node back to its pool, with everything below it.
    void Free();
    /// A deep copy that shares scalars only, owned by the caller. Throws YAMLError when a mapping in the
    /// duplicate state stands anywhere in it.
    YAMLNode* Clone() const;
    /// Equality by identity for scalars and by hash for containers: where both hashes are known the contents
    /// are not looked at, and neither is the kind of `other`. `other` must not be null.
    bool Equals(const YAMLNode* other) const;
    /// Equality that walks: item by item for sequences; for mappings the key lists alone decide.
    bool EqualsExpensive(const YAMLNode* other) const;
    void Accept(YAMLNodeVisitor& visitor);
    /// Builds m_Hash anew, with `shallow` from the children's hashes as they stand. All items must be
    /// non-null.
    void RebuildHash(bool shallow);

protected:
    explicit YAMLNode(Kind kind) : m_Kind(kind) {}
    ~YAMLNode() = default;

private:
    const Kind m_Kind;
};

/// The node as a T (YAMLScalar, YAMLMapping or YAMLSequence, as const as the node), or null if it is null or
/// of another kind. AsScalar, AsMapping and AsSequence stand in the headers of these classes.
template <class T, class Node> T* NodeAs(Node* node) {
    return node && node->GetKind() == T::kKind ? static_cast<T*>(node) : nullptr;
}

/// A deep copy, as YAMLNode::Clone, that keeps mappings in the duplicate state as they are.
YAMLNode* CopyExactly(const YAMLNode* node);

/// The node as a mapping or a sequence. Throws std::bad_cast if it is null or of another kind.
YAMLMapping& ToMapping(YAMLNode* node);
YAMLSequence& ToSequence(YAMLNode* node);

} // namespace ovrin_yaml
