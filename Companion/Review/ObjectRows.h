#pragma once

#include "Names/MergeNames.h"
#include "Names/PropertyName.h"
#include "Names/RecordPlace.h"
#include "Review/ConflictMark.h"
#include "Review/ValueShape.h"

#include <array>
#include <span>
#include <string>
#include <string_view>
#include <unordered_map>
#include <vector>

namespace ovrin {

/// A property of an object in all versions and the result.
struct ObjectRow {
    std::string property; ///< as in Names/PropertyName.h; empty for the object as a whole
    std::string place;    ///< keys and indexes from the object's class on; tells rows of one property apart
    ValueShape shape = ValueShape::Other;
    bool byOurs = false, byTheirs = false;                  ///< who changed it
    const ConflictMark* conflict = nullptr;                 ///< the one about this very place
    std::array<const ovrin_yaml::YAMLNode*, 4> values = {}; ///< null where a version has none
};

/// Lists the properties of objects, as deep as a person looks at them: the fields of a mapping are rows, and
/// the elements of a list that the rules give a key; a colour, a vector, a reference and a list without keys
/// is a row each, with a row more for each place in it that has a conflict.
///
/// Only what the diffs of the sides name, what the result has otherwise, and what has a conflict is looked
/// into. For one thread at a time, as long as the merge and all names live.
class ObjectRows {
public:
    using ID = MergeNames::ID;

    /// `result` are the names of the merge's present result.
    ObjectRows(SceneMerge& merge, const MergeNames& names, const ObjectNames& result);

    /// At most `most` rows, those about conflicts of the object always among them; `isShortened` tells
    /// whether there were more. With `all` those that nobody changed, too.
    struct Wish {
        std::span<const ConflictMark> conflicts; ///< those about the object
        bool all = false;
        std::size_t most = 2000;
    };
    std::vector<ObjectRow> Of(ID id, const Wish& wish, bool& isShortened);

private:
    using Node = ovrin_yaml::YAMLNode;
    using Values = std::array<const Node*, 4>;

    /// Where the walk stands, with what the sides did there.
    struct Step {
        Values values;
        const ovrin_yaml::Operation *theirs, *ours;
    };
    struct Met {
        const ConflictMark* mark;
        RecordPlace place;
        bool isTold = false;
    };

    void Walk(const Step& step);
    void WalkFields(const Step& step);
    bool WalkElements(const Step& step);
    void Meet(const ConflictMark& mark);
    void Take(Met& met);
    void WalkInto(ID key, const Step& step);
    void AddRow(const Step& step, ValueShape shape, const ConflictMark* conflict);
    void AddUntold(std::string_view below);
    Met* ConflictAt(const Step& step);
    bool HasConflictBelow() const;
    bool IsWanted(const Step& step) const;
    const PropertyNames& PropertiesOf(const Values& values, std::size_t& teller) const;

    SceneMerge& m_Merge;
    const MergeNames& m_Names;
    const ObjectNames& m_Result;
    const RecordPlaces m_Places;
    const std::array<PropertyNames, 4> m_Properties;
    // Of the object at hand.
    Wish m_Wish;
    std::vector<Met> m_Met;
    std::unordered_multimap<std::string, std::size_t> m_At; // conflicts by their words
    std::unordered_map<std::string, int> m_Below;           // how many untold ones stand below a place
    ovrin_yaml::Path m_Path;
    std::string m_Property;
    std::vector<ObjectRow> m_Rows;
    bool m_IsShortened = false;
};

} // namespace ovrin
