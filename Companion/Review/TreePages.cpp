#include "Review/TreePages.h"

#include "Names/PrintableText.h"

#include <algorithm>
#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

namespace {

const char* KindName(NodeKind kind) {
    return kind == NodeKind::Place ? "place" : kind == NodeKind::Component ? "component" : "other";
}

std::string InSmallLetters(std::string text) {
    for (char& letter : text)
        if (letter >= 'A' && letter <= 'Z') letter = static_cast<char>(letter - 'A' + 'a');
    return text;
}

/// The part of a list that a range takes.
template <class List> std::span<const typename List::value_type> Part(const List& list, PageRange range) {
    const std::size_t from = std::min(range.from, list.size());
    return std::span(list).subspan(from, std::min(range.count, list.size() - from));
}

} // namespace

std::string TreePages::LabelOf(Index node) const {
    const MarkedNode& about = m_Tree.Nodes()[node];
    return OwnLabel(m_Names.In(about.teller), about.id);
}

json TreePages::NodeOf(Index index, bool touchedOnly) const {
    const MarkedNode& node = m_Tree.Nodes()[index];
    const char* author = AuthorName(node.mark);
    return {{"id", Printable(node.id->Value())},
            {"name", LabelOf(index)},
            {"kind", KindName(node.kind)},
            {"children", m_Tree.Children(index, touchedOnly).size()},
            {"mark", MarkName(node.mark.kind)},
            {"by", author ? json(author) : json()},
            {"open", node.open},
            {"below", {{"changed", node.touchedBelow}, {"open", node.openBelow}}}};
}

json TreePages::Children(std::optional<Index> parent, PageRange range, bool touchedOnly) const {
    const std::vector<Index> children = m_Tree.Children(parent, touchedOnly);
    json nodes = json::array();
    for (const Index child : Part(children, range)) nodes.push_back(NodeOf(child, touchedOnly));
    return {{"total", children.size()}, {"nodes", std::move(nodes)}};
}

json TreePages::Hits(std::string_view text, PageRange range) const {
    const std::span<const MarkedNode> nodes = m_Tree.Nodes();
    if (m_Folded.empty())
        for (Index i = 0; i < nodes.size(); ++i) m_Folded.push_back(InSmallLetters(LabelOf(i)));
    const std::string wanted = InSmallLetters(std::string(text));
    std::vector<Index> found;
    for (Index i = 0; i < nodes.size() && !wanted.empty(); ++i)
        if (m_Folded[i].find(wanted) != std::string::npos || nodes[i].id->Value() == text) found.push_back(i);
    json hits = json::array();
    for (const Index hit : Part(found, range)) {
        json way = json::array(), names = json::array();
        const std::vector<Index> all = m_Tree.Way(hit);
        for (const Index above : Part(all, {0, kMostWay})) {
            way.push_back(Printable(nodes[above].id->Value()));
            names.push_back(LabelOf(above));
        }
        hits.push_back({{"id", Printable(nodes[hit].id->Value())},
                        {"name", LabelOf(hit)},
                        {"way", std::move(way)},
                        {"names", std::move(names)}});
        if (all.size() > kMostWay) hits.back()["isShortened"] = true;
    }
    return {{"total", found.size()}, {"hits", std::move(hits)}};
}

} // namespace ovrin
