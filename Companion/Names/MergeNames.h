#pragma once

#include "Names/ObjectNames.h"

#include <array>
#include <cstdint>
#include <optional>
#include <span>
#include <string>
#include <vector>

namespace ovrin_yaml {
class MergeSession;
}

namespace ovrin {

/// The versions of a file that a merge knows.
enum class Version : std::uint8_t { Base, Ours, Theirs };

/// The names of the objects of a merge, from all three versions together: that of ours, else of theirs, else
/// of base. Where another version has another name for the object it is told with it:
///
///     Harbour/Lantern (theirs: Harbour/Lamp)
///     Harbour/Lantern (base and theirs: Harbour/Lamp)
///
/// A component's number among others of its class is no difference. For one thread at a time.
class MergeNames {
public:
    using ID = ObjectNames::ID;

    /// How the versions are called, in the order of Version.
    using Words = std::array<std::string, 3>;

    /// The trees, in the order of Version, must stay as they are as long as names are asked for.
    MergeNames(const ovrin_yaml::YAMLMapping& base, const ovrin_yaml::YAMLMapping& ours,
               const ovrin_yaml::YAMLMapping& theirs, Words words = {"base", "ours", "theirs"});
    /// Of a session that has read its three files: ours is the right one, theirs the left.
    explicit MergeNames(ovrin_yaml::MergeSession& session, Words words = {"base", "ours", "theirs"});

    std::string Name(ID id) const;
    /// "Harbour/Lantern (734813)", with other names behind the id: "Harbour/Lantern (734813, theirs:
    /// Harbour/Lamp)".
    std::string NameWithID(ID id) const;
    /// The names in one version; "(missing 12)" where it lacks the object.
    const ObjectNames& In(Version version) const { return m_Names[static_cast<std::size_t>(version)]; }
    /// Whether the version has the object.
    bool Has(Version version, ID id) const { return In(version).Has(id); }
    /// The version whose name comes first; nothing if none has the object.
    std::optional<Version> Leading(ID id) const;
    /// What the object stands under there (ObjectNames::Above).
    ID Above(ID id) const;

    /// The places of `ids` in the hierarchy's order (Names/HierarchyOrder.h): an object stands where ours has
    /// it, else theirs, else base.
    std::vector<std::uint32_t> Ranks(std::span<const ID> ids) const;

private:
    struct Together {
        std::string name;
        std::string others; ///< "theirs: Harbour/Lamp"
    };
    Together NamesOf(ID id, Version leading) const;

    const std::array<ObjectNames, 3> m_Names;
    const Words m_Words;
};

} // namespace ovrin
