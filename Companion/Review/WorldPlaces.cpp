#include "Review/WorldPlaces.h"

#include "Review/LocalPlace.h"

#include "Diff/YAMLMappingDiff.h"

namespace ovrin {

using namespace ovrin_yaml;

/// The frames of all parts, which become those of the world.
class WorldPlaces::Frames {
public:
    explicit Frames(const WorldPlaces& places) : m_Places(places), m_States(places.m_Parts.size()) {
        m_Frames.reserve(places.m_Parts.size());
        for (const Part& part : places.m_Parts) m_Frames.push_back(part.frame);
        for (std::uint32_t i = 0; i < m_Frames.size(); ++i) Place(i);
    }

    const Point& Origin(std::size_t part) const { return m_Frames[part].origin; }

private:
    enum class State : unsigned char { New, OnTheWay, Done };
    static constexpr std::uint32_t kNone = ~std::uint32_t{0};

    std::uint32_t ParentOf(std::uint32_t index) const {
        const ID parent = m_Places.m_Parts[index].parent;
        const auto found = parent ? m_Places.m_Indexes.find(parent) : m_Places.m_Indexes.end();
        const bool isThere = found != m_Places.m_Indexes.end() && !m_Places.m_Parts[found->second].isGone;
        return isThere ? found->second : kNone;
    }

    void Place(std::uint32_t index) {
        std::vector<std::uint32_t> way; // upwards
        std::uint32_t above = index;
        while (above != kNone && m_States[above] == State::New) {
            m_States[above] = State::OnTheWay;
            way.push_back(above);
            above = ParentOf(above);
        }
        std::size_t count = way.size();
        if (above != kNone && m_States[above] == State::OnTheWay) {
            // All members of a loop stand at the top, so that no place depends on where the way began.
            for (std::uint32_t member = kNone; member != above;) {
                member = way[--count];
                m_States[member] = State::Done;
            }
        }
        while (count > 0) {
            const std::uint32_t below = way[--count];
            if (above != kNone) m_Frames[below] = m_Frames[above].After(m_Frames[below]);
            m_States[below] = State::Done;
            above = below;
        }
    }

    const WorldPlaces& m_Places;
    std::vector<State> m_States;
    std::vector<Affine> m_Frames;
};

WorldPlaces::WorldPlaces(const ObjectNames& names) {
    for (const YAMLMapping::Entry entry : names.Places().Root().RawEntries())
        if (entry.key && HasPlace(BodyOf(entry.value))) Read(entry.key, names);
    Place();
}

WorldPlaces::WorldPlaces(const WorldPlaces& before, const YAMLMappingDiff& diff, const ObjectNames& after)
    : m_Parts(before.m_Parts), m_Indexes(before.m_Indexes) {
    for (const auto& [id, operation] : diff.Entries()) {
        if (HasPlace(after.Places().Body(id)))
            Read(id, after);
        else if (const auto known = m_Indexes.find(id); known != m_Indexes.end())
            m_Parts[known->second].isGone = true;
    }
    Place();
}

void WorldPlaces::Read(ID id, const ObjectNames& names) {
    const ObjectBody body = names.Places().Body(id);
    const LocalPlace local = LocalPlaceOf(body);
    const ID place = body.isStripped ? nullptr : names.Places().PlaceIDOf(body, id);
    const auto [found, isNew] = m_Indexes.try_emplace(id, static_cast<std::uint32_t>(m_Parts.size()));
    if (isNew) m_Parts.emplace_back();
    m_Parts[found->second] = {id, local.parent, place, local.frame};
}

void WorldPlaces::Place() {
    const Frames frames(*this);
    m_Points.reserve(m_Parts.size());
    for (std::size_t i = 0; i < m_Parts.size(); ++i)
        if (m_Parts[i].place && !m_Parts[i].isGone && IsFinite(frames.Origin(i)))
            m_Points.emplace(m_Parts[i].place, frames.Origin(i));
}

const Point* WorldPlaces::Find(ID place) const {
    const auto found = m_Points.find(place);
    return found == m_Points.end() ? nullptr : &found->second;
}

} // namespace ovrin
