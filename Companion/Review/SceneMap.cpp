#include "Review/SceneMap.h"

#include "Names/PrintableText.h"

#include "Session/MergeSession.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <numeric>

namespace ovrin {

using nlohmann::json;

namespace {

using Spot = std::array<double, 2>;

Spot SpotOf(const Point& point, MapView view) {
    return {point.x, view == MapView::Top ? point.z : point.y};
}

bool IsIn(const MapBox& box, const Spot& spot) {
    return spot[0] >= box.x0 && spot[0] <= box.x1 && spot[1] >= box.y0 && spot[1] <= box.y1;
}

void Widen(std::optional<MapBox>& box, const Spot& spot) {
    if (!box) box = MapBox{spot[0], spot[1], spot[0], spot[1]};
    box->x0 = std::min(box->x0, spot[0]);
    box->y0 = std::min(box->y0, spot[1]);
    box->x1 = std::max(box->x1, spot[0]);
    box->y1 = std::max(box->y1, spot[1]);
}

json ToJson(const std::optional<MapBox>& box) {
    return box ? json{box->x0, box->y0, box->x1, box->y1} : json();
}

/// Which of `cells` stretches from `from` to `to` a number is in.
std::size_t CellOf(double number, double from, double to, std::size_t cells) {
    const double part = to > from ? (number - from) / (to - from) : 0;
    const double cell = part * static_cast<double>(cells);
    if (!(cell > 0)) return 0;
    return cell >= static_cast<double>(cells) ? cells - 1 : static_cast<std::size_t>(cell);
}

/// What stands in a square.
struct Square {
    std::size_t first = 0; ///< of the things
    std::size_t count = 0, changed = 0, open = 0;
    std::optional<MapBox> box;
};

json BundleJson(const Square& square) {
    const MapBox& box = *square.box;
    return {{"x", std::midpoint(box.x0, box.x1)},
            {"y", std::midpoint(box.y0, box.y1)},
            {"count", square.count},
            {"changed", square.changed},
            {"open", square.open},
            {"box", ToJson(square.box)}};
}

} // namespace

/// One answer.
class SceneMap::Drawing {
public:
    Drawing(const SceneMap& map, const MapWish& wish) : m_Map(map), m_Wish(wish) {
        for (const Thing& thing : map.m_Things)
            for (const auto& point : thing.at)
                if (point) Widen(m_Bounds, SpotOf(*point, wish.view));
        m_Box = wish.box ? wish.box : m_Bounds;
    }

    json Draw() {
        std::vector<std::size_t> touched, others;
        for (std::size_t i = 0; i < m_Map.m_Things.size(); ++i) {
            const bool isTouched = IsTouched(i);
            if (IsInBox(m_Map.m_Things[i], isTouched)) (isTouched ? touched : others).push_back(i);
        }
        json items = json::array(), bundles = json::array();
        if (touched.size() < kMostTouched)
            for (const std::size_t thing : touched) items.push_back(ItemJson(thing));
        else
            others.insert(others.end(), touched.begin(), touched.end());
        Bundle(others, items, bundles);
        return {{"bounds", ToJson(m_Bounds)},
                {"unplaced", m_Map.m_Unplaced},
                {"items", std::move(items)},
                {"bundles", std::move(bundles)}};
    }

private:
    const MarkedNode& NodeOf(std::size_t thing) const {
        return m_Map.m_Tree.Nodes()[m_Map.m_Things[thing].node];
    }
    std::span<const MarkedNode> PartsOf(std::size_t thing) const {
        return m_Map.m_Tree.PartsOf(m_Map.m_Things[thing].node);
    }
    std::size_t OpenOf(std::size_t thing) const {
        std::size_t open = NodeOf(thing).open;
        for (const MarkedNode& part : PartsOf(thing)) open += part.open;
        return open;
    }
    bool IsChanged(std::size_t thing) const { return MarkOf(thing).IsTouched(); }
    bool IsTouched(std::size_t thing) const { return IsChanged(thing) || OpenOf(thing); }

    /// That of the place, or "changed" by those who touched a component of it.
    ObjectMark MarkOf(std::size_t thing) const {
        ObjectMark mark = NodeOf(thing).mark;
        if (mark.IsTouched()) return mark;
        for (const MarkedNode& part : PartsOf(thing)) {
            if (!part.mark.IsTouched()) continue;
            mark.kind = MarkKind::Changed;
            mark.byOurs |= part.mark.byOurs;
            mark.byTheirs |= part.mark.byTheirs;
        }
        return mark;
    }

    Spot MainSpot(const Thing& thing) const {
        const auto& [base, ours, theirs] = thing.at;
        const auto isSame = [&](const std::optional<Point>& one, const std::optional<Point>& other) {
            return one && other && SpotOf(*one, m_Wish.view) == SpotOf(*other, m_Wish.view);
        };
        const bool isByTheirs = theirs && (!ours || isSame(base, ours));
        return SpotOf(isByTheirs ? *theirs : ours ? *ours : *base, m_Wish.view);
    }

    bool IsInBox(const Thing& thing, bool isTouched) const {
        if (!isTouched) return IsIn(*m_Box, MainSpot(thing));
        return std::ranges::any_of(
            thing.at, [&](const auto& point) { return point && IsIn(*m_Box, SpotOf(*point, m_Wish.view)); });
    }

    json ItemJson(std::size_t index) const {
        const Thing& thing = m_Map.m_Things[index];
        const ObjectMark mark = MarkOf(index);
        const char* author = AuthorName(mark);
        json item = {{"id", Printable(NodeOf(index).id->Value())},
                     {"name", m_Map.m_Pages.LabelOf(thing.node)},
                     {"mark", MarkName(mark.kind)},
                     {"by", author ? json(author) : json()},
                     {"open", OpenOf(index)}};
        static constexpr const char* kVersions[] = {"base", "ours", "theirs"};
        for (std::size_t i = 0; i < thing.at.size(); ++i)
            item[kVersions[i]] = thing.at[i] ? json(SpotOf(*thing.at[i], m_Wish.view)) : json();
        return item;
    }

    void Bundle(const std::vector<std::size_t>& things, json& items, json& bundles) const {
        std::vector<Square> squares(m_Wish.cells * m_Wish.cells);
        for (const std::size_t thing : things) {
            const Spot spot = MainSpot(m_Map.m_Things[thing]);
            Square& square = squares[CellOf(spot[1], m_Box->y0, m_Box->y1, m_Wish.cells) * m_Wish.cells +
                                     CellOf(spot[0], m_Box->x0, m_Box->x1, m_Wish.cells)];
            if (square.count++ == 0) square.first = thing;
            square.changed += IsChanged(thing) ? 1 : 0;
            square.open += OpenOf(thing);
            Widen(square.box, spot);
        }
        std::vector<std::size_t> alone;
        for (const Square& square : squares) {
            if (square.count == 1) alone.push_back(square.first);
            if (square.count > 1) bundles.push_back(BundleJson(square));
        }
        std::ranges::sort(alone);
        for (const std::size_t thing : alone) items.push_back(ItemJson(thing));
    }

    const SceneMap& m_Map;
    const MapWish& m_Wish;
    std::optional<MapBox> m_Bounds, m_Box;
};

SceneMap::SceneMap(const ovrin_yaml::MergeSession& session, const SceneTree& tree, const TreePages& pages,
                   const MergeNames& names)
    : m_Tree(tree), m_Pages(pages) {
    const WorldPlaces base(names.In(Version::Base));
    const WorldPlaces ours(base, session.RightDiff(), names.In(Version::Ours));
    const WorldPlaces theirs(base, session.LeftDiff(), names.In(Version::Theirs));
    const std::array<const WorldPlaces*, 3> versions = {&base, &ours, &theirs};
    const std::span<const MarkedNode> nodes = tree.Nodes();
    for (SceneTree::Index i = 0; i < nodes.size(); ++i) {
        if (nodes[i].kind != NodeKind::Place) continue;
        Thing thing{i, {}};
        for (std::size_t v = 0; v < versions.size(); ++v)
            if (const Point* point = versions[v]->Find(nodes[i].id)) thing.at[v] = *point;
        if (std::ranges::any_of(thing.at, [](const auto& point) { return point.has_value(); }))
            m_Things.push_back(thing);
        else
            ++m_Unplaced;
    }
}

json SceneMap::Draw(const MapWish& wish) const {
    return Drawing(*this, wish).Draw();
}

} // namespace ovrin
