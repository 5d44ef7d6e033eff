#include "Review/ViewRequests.h"

#include "Review/FieldNumber.h"
#include "Review/SceneView.h"
#include "Words/Failure.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

namespace {

constexpr std::size_t kMostNodes = 1000;

PageRange RangeOf(const PageRequest& request, std::size_t count) {
    constexpr auto kAnywhere = static_cast<std::size_t>(-1);
    return {QueryNumber(request, "from", 0, kAnywhere), QueryNumber(request, "count", count, kMostNodes)};
}

bool IsSet(const PageRequest& request, const std::string& key) {
    return QueryText(request, key) == "1";
}

PageAnswer Found(const json& found) {
    return !found.is_null() ? JsonAnswer(found) : PageError(404, "No version of the scene has this object");
}

std::optional<MapBox> BoxOf(const PageRequest& request) {
    MapBox box;
    std::size_t given = 0;
    for (const auto& [key, edge] :
         {std::pair("x0", &box.x0), {"y0", &box.y0}, {"x1", &box.x1}, {"y1", &box.y1}}) {
        const std::string text = QueryText(request, key);
        if (text.empty()) continue;
        const std::optional<double> number = NumberIn(text);
        if (!number) throw Failure(std::string("\"") + key + "\" is no number");
        *edge = *number;
        ++given;
    }
    if (given == 0) return std::nullopt;
    if (given < 4 || box.x0 > box.x1 || box.y0 > box.y1) throw Failure("The box of the map is none");
    return box;
}

PageAnswer AnswerMap(SceneView& view, const PageRequest& request) {
    MapWish wish;
    const std::string from = QueryText(request, "view");
    if (from == "side")
        wish.view = MapView::Side;
    else if (!from.empty() && from != "top")
        throw Failure("A map is seen from the top or from the side");
    wish.box = BoxOf(request);
    wish.cells = QueryNumber(request, "cells", wish.cells, SceneMap::kMostCells);
    if (wish.cells == 0) throw Failure("A map without squares shows nothing");
    return JsonAnswer(view.Map(wish));
}

} // namespace

std::optional<PageAnswer> AnswerView(SceneView& view, const PageRequest& request) {
    try {
        if (request.path == "api/tree")
            return Found(
                view.Tree(QueryText(request, "parent"), RangeOf(request, 200), IsSet(request, "changed")));
        if (request.path == "api/find")
            return JsonAnswer(view.Find(QueryText(request, "text"), RangeOf(request, 50)));
        if (request.path == "api/object")
            return Found(view.Object(QueryText(request, "id"), IsSet(request, "all")));
        if (request.path == "api/map") return AnswerMap(view, request);
        return std::nullopt;
    } catch (const Failure& failure) {
        return PageError(400, failure.what());
    }
}

} // namespace ovrin
