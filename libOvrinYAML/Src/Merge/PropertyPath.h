#pragma once

#include "Values/YAMLScalar.h"

#include <span>
#include <string>
#include <vector>

namespace ovrin_yaml {

/// The elements' texts joined by ".".
std::string PathToString(std::span<const YAMLScalar* const> path);

/// The last element of a path, which has its beginning in common with others:
///
///     1.GameObject.m_Name      1 <- GameObject <- m_Name
///     1.GameObject.m_Layer               ^------ m_Layer
///
/// Two nodes may stand for one path. A node never changes and stays as long as the process.
struct PathNode {
    const PathNode* parent; // null for a path of one element
    const YAMLScalar* element;
};

/// A path that is kept, as its last node; null is the empty path.
class KeptPath {
public:
    explicit KeptPath(const PathNode* last) : m_Last(last) {}

    const PathNode* Last() const { return m_Last; }
    /// The element of a path of one element; null for any other path.
    const YAMLScalar* OnlyElement() const { return m_Last && !m_Last->parent ? m_Last->element : nullptr; }
    Path Elements() const;

private:
    const PathNode* m_Last;
};

std::string PathToString(const KeptPath& path);

/// A path that is walked up and down, and kept at some of its places. What is kept of it shares the nodes of
/// common beginnings; they are made when they are needed first.
class WalkedPath {
public:
    WalkedPath() = default;
    WalkedPath(Path elements) : m_Elements(std::move(elements)) {}

    const Path& Elements() const { return m_Elements; }
    void Push(const YAMLScalar* element) { m_Elements.push_back(element); }
    /// The path must not be empty.
    void Pop();
    KeptPath Keep();

private:
    Path m_Elements;
    std::vector<const PathNode*> m_Nodes; // of the first elements
};

} // namespace ovrin_yaml
