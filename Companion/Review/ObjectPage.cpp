#include "Review/ObjectPage.h"

#include "Names/PrintableText.h"
#include "Review/ObjectRows.h"
#include "Review/RowJson.h"

#include "Session/MergeSession.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using namespace ovrin_yaml;
using nlohmann::json;

namespace {

constexpr std::size_t kMostRows = 2000, kMostParts = 2000;

} // namespace

json ObjectPage::Of(SceneTree::Index node, std::span<const ConflictMark> conflicts, bool all) const {
    bool isShortened = false;
    json page = Head(node);
    page["way"] = Way(node, isShortened);
    page["parts"] = Parts(node, isShortened);
    const ObjectNames result(m_Merge.Session().Result().GetMapping());
    const std::array<const ObjectNames*, 4> names = {&m_Names.In(Version::Base), &m_Names.In(Version::Ours),
                                                     &m_Names.In(Version::Theirs), &result};
    bool areMore = false;
    json rows = json::array();
    ObjectRows walk(m_Merge, m_Names, result);
    for (const ObjectRow& row : walk.Of(m_Tree.Nodes()[node].id, {conflicts, all, kMostRows}, areMore))
        rows.push_back(RowJson(row, names));
    page["rows"] = std::move(rows);
    if (isShortened || areMore) page["isShortened"] = true;
    return page;
}

json ObjectPage::Head(SceneTree::Index index) const {
    const MarkedNode& node = m_Tree.Nodes()[index];
    json names;
    for (const auto& [key, version] :
         {std::pair("base", Version::Base), {"ours", Version::Ours}, {"theirs", Version::Theirs}})
        names[key] = m_Names.Has(version, node.id) ? json(m_Names.In(version).Name(node.id)) : json();
    const char* author = AuthorName(node.mark);
    return {{"id", Printable(node.id->Value())},
            {"heading", m_Names.NameWithID(node.id)},
            {"names", std::move(names)},
            {"mark", MarkName(node.mark.kind)},
            {"by", author ? json(author) : json()}};
}

json ObjectPage::Way(SceneTree::Index node, bool& isShortened) const {
    json way = json::array();
    for (const SceneTree::Index above : m_Tree.Way(node)) {
        if (way.size() == TreePages::kMostWay) {
            isShortened = true;
            break;
        }
        way.push_back(
            {{"id", Printable(m_Tree.Nodes()[above].id->Value())}, {"name", m_Pages.LabelOf(above)}});
    }
    return way;
}

json ObjectPage::Parts(SceneTree::Index node, bool& isShortened) const {
    json parts = json::array();
    SceneTree::Index child = node;
    for (const MarkedNode& part : m_Tree.PartsOf(node)) {
        ++child;
        if (parts.size() == kMostParts) {
            isShortened = true;
            break;
        }
        parts.push_back({{"id", Printable(part.id->Value())},
                         {"name", m_Pages.LabelOf(child)},
                         {"mark", MarkName(part.mark.kind)},
                         {"open", part.open}});
    }
    return parts;
}

} // namespace ovrin
