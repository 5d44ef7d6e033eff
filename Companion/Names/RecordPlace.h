#pragma once

#include "Names/ListNumbering.h"
#include "Names/MergeNames.h"
#include "Names/PropertyName.h"

#include "Session/MergeSession.h"

#include <array>
#include <map>
#include <span>
#include <string>
#include <utility>

namespace ovrin {

/// Where a record of a merge stands, for a person and in the trees.
struct RecordPlace {
    /// The words for the place within the object, as PropertyNames gives them; empty for the object as a
    /// whole.
    std::string property;
    /// The value at the place in each version, in the order of Version; null where a version has none.
    std::array<const ovrin_yaml::YAMLNode*, 3> values = {};
    /// The mapping or list that the value is an entry of; null where there is none.
    std::array<const ovrin_yaml::YAMLNode*, 3> holders = {};

    const ovrin_yaml::YAMLNode* In(Version version) const {
        return values[static_cast<std::size_t>(version)];
    }
};

/// Finds the places of records. Their paths count the elements of a list as the merged list has them, which
/// stands in no version: the numbering is found again from the changes of both sides, once for each list.
///
/// For one thread at a time, and as long as session and names live.
class RecordPlaces {
public:
    using Record = ovrin_yaml::MergeSession::Record;
    using ID = ObjectNames::ID;

    /// The session must have come as far as Merge; `names` are those of its trees.
    RecordPlaces(const ovrin_yaml::MergeSession& session, const MergeNames& names);

    /// The place of a record of the session's resolver.
    RecordPlace Find(const Record& record) const;

private:
    /// A place on the way, with the changes that the sides made there.
    struct Step {
        RecordPlace place;
        const ovrin_yaml::Operation* theirs;
        const ovrin_yaml::Operation* ours;
        bool isAdded = false; ///< both sides added what the place stands in, so that they changed nothing

        bool IsAddedInside() const;
    };
    struct Search {
        const ovrin_yaml::Path path;
        const Record& record;
        std::optional<RecordPlace> likely; ///< the first that fits the path
    };
    bool Follow(Search& search, std::size_t at, const Step& step, RecordPlace& found) const;
    bool FollowInList(Search& search, std::size_t at, const Step& step, RecordPlace& found) const;
    bool IsClass(const Search& search, std::size_t at) const;
    Step IntoMapping(const Search& search, std::size_t at, const Step& step) const;
    Step IntoList(const Search& search, std::size_t at, const Step& step,
                  const ListNumbering::Indexes& indexes) const;
    const ListNumbering& NumberingOf(const Search& search, std::size_t at, const Step& step) const;

    const ovrin_yaml::MergeSession& m_Session;
    const MergeNames& m_Names;
    const std::array<PropertyNames, 3> m_Properties;
    using Changes = std::pair<const ovrin_yaml::Operation*, const ovrin_yaml::Operation*>;
    mutable std::map<Changes, ListNumbering> m_Numberings;
};

} // namespace ovrin
