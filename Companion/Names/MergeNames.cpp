#include "Names/MergeNames.h"

#include "Names/HierarchyOrder.h"
#include "Names/PrintableText.h"

#include "Session/MergeSession.h"

#include <algorithm>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

constexpr Version kVersions[] = {Version::Base, Version::Ours, Version::Theirs};
constexpr Version kLeading[] = {Version::Ours, Version::Theirs, Version::Base};

/// A name without its number.
std::string Unnumbered(ObjectNames::Parts parts) {
    parts.number = 0;
    return parts.Text();
}

} // namespace

MergeNames::MergeNames(const YAMLMapping& base, const YAMLMapping& ours, const YAMLMapping& theirs,
                       Words words)
    : m_Names{ObjectNames(base), ObjectNames(ours), ObjectNames(theirs)}, m_Words(std::move(words)) {}

MergeNames::MergeNames(MergeSession& session, Words words)
    : MergeNames(session.BaseObjects().GetMapping(), session.RightObjects().GetMapping(),
                 session.LeftObjects().GetMapping(), std::move(words)) {}

std::optional<Version> MergeNames::Leading(ID id) const {
    for (const Version version : kLeading)
        if (Has(version, id)) return version;
    return std::nullopt;
}

MergeNames::Together MergeNames::NamesOf(ID id, Version leading) const {
    ObjectNames::Parts first = In(leading).NameOf(id);
    const std::string known = Unnumbered(first);
    std::vector<std::pair<std::string, std::string>> others; // versions and the name they have
    for (const Version version : kVersions) {
        if (version == leading || !Has(version, id)) continue;
        const ObjectNames::Parts parts = In(version).NameOf(id);
        const std::string name = Unnumbered(parts);
        if (name == known) {
            if (!first.number) first.number = parts.number;
            continue;
        }
        const std::string& word = m_Words[static_cast<std::size_t>(version)];
        const auto same = std::ranges::find(others, name, &std::pair<std::string, std::string>::second);
        if (same == others.end())
            others.emplace_back(word, name);
        else
            same->first += " and " + word;
    }
    Together names{first.Text(), ""};
    for (const auto& [versions, name] : others) {
        if (!names.others.empty()) names.others += ", ";
        names.others.append(versions).append(": ").append(name);
    }
    return names;
}

std::string MergeNames::Name(ID id) const {
    const std::optional<Version> leading = Leading(id);
    if (!leading) return In(Version::Ours).Name(id);
    const Together names = NamesOf(id, *leading);
    return names.others.empty() ? names.name : names.name + " (" + names.others + ")";
}

std::string MergeNames::NameWithID(ID id) const {
    const std::optional<Version> leading = Leading(id);
    if (!leading) return In(Version::Ours).NameWithID(id);
    const Together names = NamesOf(id, *leading);
    const std::string behind = names.others.empty() ? "" : ", " + names.others;
    return names.name + " (" + Printable(id->Value()) + behind + ")";
}

ObjectNames::ID MergeNames::Above(ID id) const {
    const std::optional<Version> leading = Leading(id);
    return leading ? In(*leading).Above(id) : nullptr;
}

std::vector<std::uint32_t> MergeNames::Ranks(std::span<const ID> ids) const {
    std::vector<const ObjectNames*> trees;
    for (const Version version : kLeading) trees.push_back(&In(version));
    return HierarchyRanks(trees, ids);
}

} // namespace ovrin
