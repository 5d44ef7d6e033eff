#include "Review/WorldPlaces.h"

#include "Review/LocalPlace.h"

#include <cstdint>

namespace ovrin {

using namespace ovrin_yaml;

/// All frames of a scene, as indexes into one list.
class WorldPlaces::Frames {
public:
    explicit Frames(const ObjectNames& names) : m_Names(names) {
        for (const YAMLMapping::Entry entry : names.Places().Root().RawEntries()) {
            const ObjectBody body = BodyOf(entry.value);
            if (!entry.key || !HasPlace(body)) continue;
            if (!m_Indexes.emplace(entry.key, static_cast<std::uint32_t>(m_Frames.size())).second) continue;
            const LocalPlace place = LocalPlaceOf(body);
            m_Frames.push_back({entry.key, place.parent, place.frame});
        }
        for (std::uint32_t i = 0; i < m_Frames.size(); ++i) Place(i);
    }

    void AddPoints(std::unordered_map<ID, Point>& points) const {
        points.reserve(m_Frames.size());
        for (const Frame& frame : m_Frames) {
            const ObjectBody body = m_Names.Places().Body(frame.id);
            const ID place = body.isStripped ? nullptr : m_Names.Places().PlaceIDOf(body, frame.id);
            if (place && IsFinite(frame.frame.origin)) points.emplace(place, frame.frame.origin);
        }
    }

private:
    static constexpr std::uint32_t kNone = ~std::uint32_t{0};

    std::uint32_t ParentOf(const Frame& frame) const {
        const auto found = frame.parentID ? m_Indexes.find(frame.parentID) : m_Indexes.end();
        return found == m_Indexes.end() ? kNone : found->second;
    }

    void Place(std::uint32_t index) {
        std::vector<std::uint32_t> way; // upwards
        std::uint32_t above = index;
        while (above != kNone && m_Frames[above].state == Frame::State::New) {
            m_Frames[above].state = Frame::State::OnTheWay;
            way.push_back(above);
            above = ParentOf(m_Frames[above]);
        }
        std::size_t count = way.size();
        if (above != kNone && m_Frames[above].state == Frame::State::OnTheWay) {
            // All members of a loop stand at the top, so that no place depends on where the way began.
            for (std::uint32_t member = kNone; member != above;) {
                member = way[--count];
                m_Frames[member].state = Frame::State::Done;
            }
        }
        while (count > 0) {
            Frame& frame = m_Frames[way[--count]];
            if (above != kNone) frame.frame = m_Frames[above].frame.After(frame.frame);
            frame.state = Frame::State::Done;
            above = way[count];
        }
    }

    const ObjectNames& m_Names;
    std::vector<Frame> m_Frames;
    std::unordered_map<ID, std::uint32_t> m_Indexes;
};

WorldPlaces::WorldPlaces(const ObjectNames& names) {
    Frames(names).AddPoints(m_Points);
}

const Point* WorldPlaces::Find(ID place) const {
    const auto found = m_Points.find(place);
    return found == m_Points.end() ? nullptr : &found->second;
}

} // namespace ovrin
