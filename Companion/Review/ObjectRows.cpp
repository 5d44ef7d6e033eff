#include "Review/ObjectRows.h"

#include "Review/KeyedElements.h"

#include "Diff/YAMLMappingDiff.h"
#include "Diff/YAMLSequenceDiff.h"
#include "Values/OvrinObjects.h"

#include <algorithm>
#include <unordered_set>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

constexpr std::size_t kColumns = 4;
constexpr std::size_t kBase = 0, kOurs = 1, kTheirs = 2, kResult = 3;

/// What a side did to a field, as far as its change of the mapping tells; a mapping that came or was replaced
/// as a whole brought all its fields.
const Operation* ChangeOfField(const Operation* change, const YAMLScalar* key) {
    const auto* mapping = As<ChangeMappingOperation>(change);
    return mapping ? mapping->m_Diff->Find(key) : change;
}

const Operation* ChangeOfElement(const Operation* change, int index) {
    const auto* list = As<ChangeSequenceOperation>(change);
    return list ? (index < 0 ? nullptr : list->m_Diff->Find(index)) : change;
}

bool IsChanged(const YAMLNode* before, const YAMLNode* after, const Operation* operation) {
    if (!before != !after) return true;
    return operation && !IsSameValue(before, after);
}

bool IsBelow(std::string_view property, std::string_view above) {
    if (property.size() <= above.size() || !property.starts_with(above)) return false;
    return property[above.size()] == '.' || property[above.size()] == '[';
}

/// Calls take(place) for all that a place may stand in, by its words: what is in brackets may have any.
template <class Take> void ForEachBeginning(const std::string& property, const Take& take) {
    for (std::size_t i = 1; i < property.size(); ++i)
        if (property[i] == '.' || property[i] == '[') take(property.substr(0, i));
}

/// The keys of all versions, those of the leading one first.
std::vector<const YAMLScalar*> KeysOf(const std::array<const YAMLNode*, kColumns>& values) {
    std::vector<const YAMLScalar*> keys;
    std::unordered_set<const YAMLScalar*> met;
    for (const std::size_t column : {kResult, kOurs, kTheirs, kBase})
        if (const YAMLMapping* mapping = AsMapping(values[column]))
            for (const YAMLMapping::Entry entry : mapping->RawEntries())
                if (entry.key && !IsPlaceHolderKey(entry.key) && met.insert(entry.key).second)
                    keys.push_back(entry.key);
    return keys;
}

} // namespace

ObjectRows::ObjectRows(SceneMerge& merge, const MergeNames& names, const ObjectNames& result)
    : m_Merge(merge), m_Names(names), m_Result(result),
      m_Places(merge.Session(), names), m_Properties{
                                            PropertyNames(names.In(Version::Base), merge.Session().Rules()),
                                            PropertyNames(names.In(Version::Ours), merge.Session().Rules()),
                                            PropertyNames(names.In(Version::Theirs), merge.Session().Rules()),
                                            PropertyNames(result, merge.Session().Rules())} {}

std::vector<ObjectRow> ObjectRows::Of(ID id, const Wish& wish, bool& isShortened) {
    m_Wish = wish;
    m_Met.clear();
    m_At.clear();
    m_Below.clear();
    m_Rows.clear();
    m_Property.clear();
    m_Path = {id};
    m_IsShortened = false;
    for (const ConflictMark& mark : wish.conflicts) Meet(mark);
    const MergeSession& session = m_Merge.Session();
    const Step step{{m_Names.In(Version::Base).Find(id), m_Names.In(Version::Ours).Find(id),
                     m_Names.In(Version::Theirs).Find(id), m_Result.Find(id)},
                    session.LeftDiff().Find(id),
                    session.RightDiff().Find(id)};
    if (Met* met = ConflictAt(step)) AddRow(step, ValueShape::Other, met->mark);
    WalkFields(step);
    AddUntold("");
    isShortened = m_IsShortened;
    return std::move(m_Rows);
}

void ObjectRows::Walk(const Step& step) {
    if (!IsWanted(step)) return;
    const ValueShape shape = CommonShape(step.values);
    if (const Met* met = ConflictAt(step)) return AddRow(step, shape, met->mark);
    const bool isInside = HasConflictBelow();
    if (shape == ValueShape::Fields ||
        (isInside && (shape == ValueShape::Colour || shape == ValueShape::Vector)))
        return WalkFields(step);
    const std::size_t told = m_Rows.size();
    if (shape == ValueShape::List && WalkElements(step) && m_Rows.size() > told) return;
    AddRow(step, shape, nullptr); // of elements with keys, too, if nothing but their order differs
    if (isInside) AddUntold(m_Property);
}

void ObjectRows::WalkFields(const Step& step) {
    const std::vector<ID> keys = KeysOf(step.values);
    const bool isEmpty = keys.empty() && m_Path.size() > 1;
    if (isEmpty) return AddRow(step, ValueShape::Other, nullptr);
    for (const ID key : keys) {
        const std::size_t size = m_Property.size();
        if (m_Path.size() > 1) AddKey(m_Property, key);
        Step next{{}, ChangeOfField(step.theirs, key), ChangeOfField(step.ours, key)};
        for (std::size_t i = 0; i < kColumns; ++i) next.values[i] = FieldOf(step.values[i], key);
        WalkInto(key, next);
        m_Property.resize(size);
    }
}

/// False for a list whose elements have no keys.
bool ObjectRows::WalkElements(const Step& step) {
    const ListRule& rule = m_Merge.Session().Rules().SelectKeyPaths(m_Path);
    const auto elements = MatchElements(step.values, rule);
    if (!elements || elements->empty()) return false;
    for (const ElementIndexes& indexes : *elements) {
        Step next{
            {}, ChangeOfElement(step.theirs, indexes[kTheirs]), ChangeOfElement(step.ours, indexes[kOurs])};
        for (std::size_t i = 0; i < kColumns; ++i)
            if (indexes[i] >= 0)
                next.values[i] = ItemsOf(step.values[i])[static_cast<std::size_t>(indexes[i])];
        std::size_t teller = 0;
        const PropertyNames& properties = PropertiesOf(next.values, teller);
        const ID number = IndexScalar(indexes[teller]);
        const std::size_t size = m_Property.size();
        AddElement(m_Property,
                   properties.ElementName(m_Path, step.values[teller], next.values[teller], number));
        WalkInto(number, next);
        m_Property.resize(size);
    }
    return true;
}

void ObjectRows::WalkInto(ID key, const Step& step) {
    m_Path.push_back(key);
    Walk(step);
    m_Path.pop_back();
}

/// The names of the version whose words Names/RecordPlace.h has for an element.
const PropertyNames& ObjectRows::PropertiesOf(const Values& values, std::size_t& teller) const {
    for (const std::size_t column : {kOurs, kTheirs, kBase, kResult})
        if (values[column]) {
            teller = column;
            break;
        }
    return m_Properties[teller];
}

/// The words say the place, and the values tell elements of the same words apart.
ObjectRows::Met* ObjectRows::ConflictAt(const Step& step) {
    const auto [begin, end] = m_At.equal_range(m_Property);
    for (auto at = begin; at != end; ++at) {
        Met& met = m_Met[at->second];
        if (met.isTold || !std::ranges::equal(met.place.values, std::span(step.values).first(kResult)))
            continue;
        Take(met);
        return &met;
    }
    return nullptr;
}

void ObjectRows::Meet(const ConflictMark& mark) {
    m_Met.push_back({&mark, m_Places.Find(mark.about->record)});
    const std::string& property = m_Met.back().place.property;
    m_At.emplace(property, m_Met.size() - 1);
    ForEachBeginning(property, [&](const std::string& above) { ++m_Below[above]; });
}

void ObjectRows::Take(Met& met) {
    met.isTold = true;
    ForEachBeginning(met.place.property, [&](const std::string& above) { --m_Below[above]; });
}

bool ObjectRows::HasConflictBelow() const {
    const auto found = m_Below.find(m_Property);
    return found != m_Below.end() && found->second > 0;
}

bool ObjectRows::IsWanted(const Step& step) const {
    const Values& values = step.values;
    if (m_Wish.all || IsChanged(values[kBase], values[kOurs], step.ours) ||
        IsChanged(values[kBase], values[kTheirs], step.theirs))
        return true;
    if (m_At.contains(m_Property) || HasConflictBelow()) return true;
    return std::ranges::none_of(std::span(values).first(kResult),
                                [&](const Node* version) { return IsSameValue(version, values[kResult]); });
}

void ObjectRows::AddRow(const Step& step, ValueShape shape, const ConflictMark* conflict) {
    if (m_Rows.size() >= m_Wish.most && !conflict) {
        m_IsShortened = true;
        return;
    }
    ObjectRow row;
    row.property = m_Property;
    row.place = PathToString(std::span(m_Path).subspan(1));
    row.shape = shape;
    row.byOurs = IsChanged(step.values[kBase], step.values[kOurs], step.ours);
    row.byTheirs = IsChanged(step.values[kBase], step.values[kTheirs], step.theirs);
    row.conflict = conflict;
    row.values = step.values;
    m_Rows.push_back(std::move(row));
}

/// The conflicts below a place that no row could tell, such as those in lists whose elements have no keys.
void ObjectRows::AddUntold(std::string_view below) {
    for (Met& met : m_Met) {
        if (met.isTold || !(below.empty() || IsBelow(met.place.property, below))) continue;
        Take(met);
        ObjectRow row;
        row.property = met.place.property;
        row.place = PathToString(met.mark->about->path);
        for (std::size_t i = 0; i < met.place.values.size(); ++i) row.values[i] = met.place.values[i];
        row.shape = CommonShape(std::span(row.values).first(kResult));
        row.byOurs = !IsSameValue(row.values[kBase], row.values[kOurs]);
        row.byTheirs = !IsSameValue(row.values[kBase], row.values[kTheirs]);
        row.conflict = met.mark;
        m_Rows.push_back(std::move(row));
    }
}

} // namespace ovrin
