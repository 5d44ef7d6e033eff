#include "Review/ConflictItem.h"

#include "Names/PrintableText.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using nlohmann::json;

namespace {

constexpr std::size_t kWidth = 200, kChoiceWidth = 100;

json NameOrNull(const std::optional<Side>& side) {
    return side ? json(SideName(*side)) : json();
}

} // namespace

json ConflictItem(const Conflict& conflict, const ItemState& state) {
    json item = {{"index", state.index},
                 {"scene", state.scene},
                 {"path", Printable(conflict.path)},
                 {"id", Printable(conflict.id)},
                 {"object", conflict.object},
                 {"heading", conflict.heading},
                 {"property", conflict.property},
                 {"kind", CodeOf(conflict.kind)},
                 {"what", WhatHappened(conflict.kind)},
                 {"isOpen", state.isOpen},
                 {"decided", NameOrNull(state.decided)},
                 {"proposed", NameOrNull(state.proposed)}};
    for (const Side side : {Side::Base, Side::Ours, Side::Theirs}) {
        item["words"][SideName(side)] = ShortenedAtEnd(conflict.WordsOf(side), kWidth);
        item["choices"][SideName(side)] = ShortenedAtEnd(conflict.ChoiceOf(side), kChoiceWidth);
    }
    return item;
}

} // namespace ovrin
