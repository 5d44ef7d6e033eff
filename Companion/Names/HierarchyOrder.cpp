#include "Names/HierarchyOrder.h"

#include <algorithm>
#include <limits>
#include <tuple>
#include <unordered_map>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

using ID = ObjectNames::ID;
constexpr std::uint32_t kNone = std::numeric_limits<std::uint32_t>::max();

/// An object in the order, with what it is sorted by among those of the same parent.
struct Node {
    ID id;
    std::uint32_t tree;           ///< the first that has it
    std::uint32_t parent = kNone; ///< node; kNone at the top
    bool isPlace = false;         ///< what belongs to the parent itself goes ahead of the places below it
    std::uint32_t listed = 0;     ///< position in the parent's list
    std::uint32_t inFile = kNone; ///< position in the file; only of those that no list settles

    auto Key() const {
        // At the top one file follows the other, and the list says nothing.
        const std::uint32_t first = parent == kNone ? tree : 0;
        return std::tuple(parent, isPlace, first, listed, tree, inFile);
    }
};

class Order {
public:
    Order(std::span<const ObjectNames* const> trees, std::span<const ID> ids) : m_Trees(trees) {
        for (const ID id : ids) IndexOf(id);
        for (std::uint32_t i = 0; i < m_Nodes.size(); ++i) Connect(i);
        FindInFiles();
    }

    std::vector<std::uint32_t> Ranks() const {
        std::vector<std::uint32_t> sorted(m_Nodes.size()), ranks(m_Nodes.size());
        for (std::uint32_t i = 0; i < sorted.size(); ++i) sorted[i] = i;
        std::ranges::stable_sort(sorted, {}, [&](std::uint32_t i) { return m_Nodes[i].Key(); });
        std::uint32_t next = 0;
        std::vector<std::uint32_t> waiting; // positions in `sorted`, the next one last
        const auto wait = [&](std::uint32_t parent) {
            const auto parentOf = [&](std::uint32_t i) { return m_Nodes[i].parent; };
            const auto begin = std::ranges::lower_bound(sorted, parent, {}, parentOf);
            const auto end = std::ranges::upper_bound(sorted, parent, {}, parentOf);
            waiting.insert(waiting.end(), std::make_reverse_iterator(end), std::make_reverse_iterator(begin));
        };
        for (wait(kNone); !waiting.empty();) {
            const std::uint32_t node = waiting.back();
            waiting.pop_back();
            ranks[node] = next++;
            wait(node);
        }
        return ranks;
    }
    std::uint32_t ParentOf(std::uint32_t index) const { return m_Nodes[index].parent; }
    std::uint32_t IndexOf(ID id) {
        const auto [found, isNew] = m_Indexes.try_emplace(id, static_cast<std::uint32_t>(m_Nodes.size()));
        if (isNew) m_Nodes.push_back({.id = id, .tree = TreeOf(id)});
        return found->second;
    }

private:
    std::uint32_t TreeOf(ID id) const {
        const auto found =
            std::ranges::find_if(m_Trees, [id](const ObjectNames* names) { return names->Has(id); });
        return static_cast<std::uint32_t>(found - m_Trees.begin());
    }

    void Connect(std::uint32_t index) {
        const ID id = m_Nodes[index].id;
        if (m_Nodes[index].tree == m_Trees.size()) return;
        const ObjectNames& names = *m_Trees[m_Nodes[index].tree];
        const ID above = names.Above(id);
        if (!above) return;
        const std::uint32_t parent = IndexOf(above); // may move the nodes
        Node& node = m_Nodes[index];
        node.parent = parent;
        node.isPlace = Hierarchy::IsPlace(names.Places().Body(id));
        if (node.isPlace) {
            node.listed = names.Places().PositionAmongChildren(names.Places().PlaceOf(id));
        } else {
            const Hierarchy::Component* component = names.Places().FindComponent(above, id);
            node.listed = component ? component->position : kNone;
        }
    }

    void FindInFiles() {
        for (std::uint32_t tree = 0; tree < m_Trees.size(); ++tree) {
            const YAMLMapping::Pairs objects = m_Trees[tree]->Places().Root().RawEntries();
            for (std::uint32_t i = 0; i < objects.size(); ++i) {
                const auto found = m_Indexes.find(objects[i].key);
                if (found == m_Indexes.end()) continue;
                Node& node = m_Nodes[found->second];
                if (node.tree == tree && node.inFile == kNone) node.inFile = i;
            }
        }
    }

    const std::span<const ObjectNames* const> m_Trees;
    std::vector<Node> m_Nodes;
    std::unordered_map<ID, std::uint32_t> m_Indexes;
};

} // namespace

std::vector<HierarchyPlace> HierarchyPlaces(std::span<const ObjectNames* const> trees,
                                            std::span<const ID> ids) {
    const Order order(trees, ids);
    const std::vector<std::uint32_t> ranks = order.Ranks();
    std::vector<HierarchyPlace> places;
    places.reserve(ids.size());
    // The nodes of the ids come first, in their order.
    for (std::uint32_t i = 0; i < ids.size(); ++i) {
        const std::uint32_t parent = order.ParentOf(i);
        places.push_back({ranks[i], parent < ids.size() ? parent : HierarchyPlace::kNone});
    }
    return places;
}

std::vector<std::uint32_t> HierarchyRanks(std::span<const ObjectNames* const> trees,
                                          std::span<const ID> ids) {
    Order order(trees, ids);
    const std::vector<std::uint32_t> ofNodes = order.Ranks();
    std::vector<std::uint32_t> ranks;
    ranks.reserve(ids.size());
    for (const ID id : ids) ranks.push_back(ofNodes[order.IndexOf(id)]);
    return ranks;
}

} // namespace ovrin
