#pragma once

#include <cstddef>
#include <memory>
#include <utility>
#include <vector>

namespace ovrin_yaml {

/// A stack that a container's part is taken from at once. Unlike that of a vector its push is little enough
/// to stand wherever a node is added. Nodes are made again where others stood: they need no destruction.
template <class Node> class NodeStack {
public:
    NodeStack() : m_Nodes(kFirstRoom) {}

    template <class... Arguments> void Push(Arguments&&... arguments) {
        if (m_Size == m_Nodes.size()) [[unlikely]]
            Grow();
        std::construct_at(&m_Nodes[m_Size++], std::forward<Arguments>(arguments)...);
    }
    std::size_t Size() const { return m_Size; }
    Node& operator[](std::size_t index) { return m_Nodes[index]; }
    const Node* From(std::size_t index) const { return m_Nodes.data() + index; }
    /// Takes off what stands at `size` and above it.
    void Cut(std::size_t size) { m_Size = size; }

private:
    static constexpr std::size_t kFirstRoom = 64;

    [[gnu::noinline]] void Grow() { m_Nodes.resize(2 * m_Nodes.size()); }

    std::vector<Node> m_Nodes;
    std::size_t m_Size = 0;
};

} // namespace ovrin_yaml
