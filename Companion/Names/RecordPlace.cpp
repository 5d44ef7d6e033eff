#include "Names/RecordPlace.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"

#include <algorithm>
#include <charconv>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

constexpr std::array<Version, 3> kVersions = {Version::Base, Version::Ours, Version::Theirs};
/// Whose element tells its key: that of the version which lists are read in most.
constexpr std::array<Version, 3> kLeading = {Version::Ours, Version::Theirs, Version::Base};

std::size_t Number(Version version) {
    return static_cast<std::size_t>(version);
}

/// -1 for what is no index.
int IndexOf(const YAMLScalar* element) {
    const std::string_view text = element->Value();
    int index = -1;
    const auto [end, error] = std::from_chars(text.data(), text.data() + text.size(), index);
    return error == std::errc() && end == text.data() + text.size() ? index : -1;
}

const YAMLNode* ItemAt(const YAMLNode* list, int index) {
    const std::span<YAMLNode* const> items = ItemsOf(list);
    const auto at = static_cast<std::size_t>(index);
    return index >= 0 && at < items.size() ? items[at] : nullptr;
}

const Operation* ChangeOfKey(const Operation* change, const YAMLScalar* key) {
    const auto* mapping = As<ChangeMappingOperation>(change);
    return mapping ? mapping->m_Diff->Find(key) : nullptr;
}

const Operation* ChangeOfItem(const Operation* change, int index) {
    const auto* list = As<ChangeSequenceOperation>(change);
    return list && index >= 0 ? list->m_Diff->Find(index) : nullptr;
}

/// Whether an operation of a record is what a side did at a place.
bool IsDoneAt(const Operation* recorded, const Operation* done, const YAMLNode* value, bool isAdded) {
    if (!recorded) return true;
    if (!isAdded) return recorded == done;
    const auto* addition = As<AddOperation>(recorded);
    return addition && addition->m_Value == value;
}

} // namespace

bool RecordPlaces::Step::IsAddedInside() const {
    return isAdded || (As<AddOperation>(theirs) && As<AddOperation>(ours));
}

RecordPlaces::RecordPlaces(const MergeSession& session, const MergeNames& names)
    : m_Session(session),
      m_Names(names), m_Properties{PropertyNames(names.In(Version::Base), session.Rules()),
                                   PropertyNames(names.In(Version::Ours), session.Rules()),
                                   PropertyNames(names.In(Version::Theirs), session.Rules())} {}

RecordPlace RecordPlaces::Find(const Record& record) const {
    Search search{record.path.Elements(), record, std::nullopt};
    if (search.path.empty()) return {};
    const YAMLScalar* id = search.path[0];
    if (id == YAMLScalar::underscore) return {"(order of the keys)", {}};
    Step step{{}, m_Session.LeftDiff().Find(id), m_Session.RightDiff().Find(id)};
    for (const Version version : kVersions) step.place.values[Number(version)] = m_Names.In(version).Find(id);
    RecordPlace found;
    // What a repair recorded stands in no diff.
    return Follow(search, 1, step, found) ? found : search.likely.value_or(RecordPlace());
}

/// The same index may mean two elements, of which the operations tell the right one.
bool RecordPlaces::Follow(Search& search, std::size_t at, const Step& step, RecordPlace& found) const {
    if (at < search.path.size()) {
        const bool isList =
            std::ranges::any_of(step.place.values, [](const YAMLNode* v) { return AsSequence(v); });
        if (isList) return FollowInList(search, at, step, found);
        return Follow(search, at + 1, IntoMapping(search, at, step), found);
    }
    if (!search.likely) search.likely = step.place;
    found = step.place;
    return IsDoneAt(search.record.left, step.theirs, found.In(Version::Theirs), step.isAdded) &&
           IsDoneAt(search.record.right, step.ours, found.In(Version::Ours), step.isAdded);
}

bool RecordPlaces::FollowInList(Search& search, std::size_t at, const Step& step, RecordPlace& found) const {
    const int index = IndexOf(search.path[at]);
    if (step.isAdded) return Follow(search, at + 1, IntoList(search, at, step, {-1, index, index}), found);
    const ListNumbering& numbering = NumberingOf(search, at, step);
    if (Follow(search, at + 1, IntoList(search, at, step, numbering.Merged(index)), found)) return true;
    const auto common = numbering.AddedByBoth(index);
    return common && Follow(search, at + 1, IntoList(search, at, step, *common), found);
}

bool RecordPlaces::IsClass(const Search& search, std::size_t at) const {
    return at == 1 && std::ranges::any_of(kVersions, [&](Version version) {
               return m_Names.In(version).Places().Body(search.path[0]).className == search.path[1];
           });
}

RecordPlaces::Step RecordPlaces::IntoMapping(const Search& search, std::size_t at, const Step& step) const {
    const YAMLScalar* key = search.path[at];
    Step next{{step.place.property, {}, step.place.values},
              ChangeOfKey(step.theirs, key),
              ChangeOfKey(step.ours, key),
              step.IsAddedInside()};
    for (std::size_t i = 0; i < kVersions.size(); ++i)
        next.place.values[i] = FieldOf(step.place.values[i], key);
    if (!IsClass(search, at)) AddKey(next.place.property, key);
    return next;
}

RecordPlaces::Step RecordPlaces::IntoList(const Search& search, std::size_t at, const Step& step,
                                          const ListNumbering::Indexes& indexes) const {
    const auto& lists = step.place.values;
    Step next{{step.place.property, {}, lists},
              ChangeOfItem(step.theirs, indexes.theirs),
              ChangeOfItem(step.ours, indexes.ours),
              step.IsAddedInside()};
    const std::array<int, 3> ofVersions = {indexes.base, indexes.ours, indexes.theirs};
    for (std::size_t i = 0; i < lists.size(); ++i) next.place.values[i] = ItemAt(lists[i], ofVersions[i]);
    const auto has = [&](Version version) { return next.place.In(version) != nullptr; };
    const auto leading = std::ranges::find_if(kLeading, has);
    const std::size_t teller = Number(leading == kLeading.end() ? Version::Ours : *leading);
    AddElement(next.place.property,
               m_Properties[teller].ElementName(std::span(search.path).first(at), lists[teller],
                                                next.place.values[teller], search.path[at]));
    return next;
}

const ListNumbering& RecordPlaces::NumberingOf(const Search& search, std::size_t at, const Step& step) const {
    const auto* theirs = As<ChangeSequenceOperation>(step.theirs);
    const auto* ours = As<ChangeSequenceOperation>(step.ours);
    const Path listPath(search.path.begin(), search.path.begin() + static_cast<std::ptrdiff_t>(at));
    return m_Numberings.try_emplace({theirs, ours}, theirs, ours, m_Session.Rules().SelectKeyPaths(listPath))
        .first->second;
}

} // namespace ovrin
