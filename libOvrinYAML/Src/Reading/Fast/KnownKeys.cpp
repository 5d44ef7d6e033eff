#include "Reading/Fast/KnownKeys.h"

#include <algorithm>

namespace ovrin_yaml {

KnownKey* KnownKeys::FindOther(KeyGuess& guess, const char* position) {
    for (KnownKey* key : {guess.earlier, guess.latest->next.latest}) {
        if (!key->StandsAt(position)) continue;
        guess.Take(*key);
        return key;
    }
    return nullptr;
}

void KnownKey::Become(YAMLScalar* newScalar, std::uint32_t newParent) {
    const std::string_view text = newScalar->Value();
    char start[8] = {};
    char mask[8] = {};
    std::memcpy(start, text.data(), std::min<std::size_t>(text.size(), 8));
    if (text.size() < 8) start[text.size()] = ':';
    std::memset(mask, 0xff, std::min<std::size_t>(text.size() + 1, 8));
    scalar = newScalar;
    word = Load(start);
    wordMask = Load(mask);
    length = static_cast<std::uint32_t>(text.size());
    hash = newScalar->m_Hash;
    parent = newParent;
    shapes.reset();
}

std::uint16_t& KnownKeys::PlaceOf(const KnownKey& parent, const YAMLScalar* scalar) {
    // Numbers, not addresses: what is guessed must not depend on them.
    const std::uint32_t first =
        (parent.number * 0x9e3779b1u ^ scalar->m_Hash) * 0x85ebca6bu >> (32 - kPlaceBits);
    std::uint16_t* place = &m_Places[first];
    for (std::size_t left = kProbes; left > 1 && *place; --left, ++place) {
        const KnownKey& key = m_Keys[*place - 1u];
        if (key.scalar == scalar && key.parent == parent.number) break;
    }
    return *place;
}

KnownKey& KnownKeys::Learn(const KnownKey& parent, YAMLScalar* scalar, KeyGuess& guess) {
    std::uint16_t& place = PlaceOf(parent, scalar);
    if (!place) {
        m_Keys.emplace_back(static_cast<std::uint32_t>(m_Keys.size() + 1));
        place = static_cast<std::uint16_t>(m_Keys.size());
    }
    KnownKey& key = m_Keys[place - 1u];
    if (key.scalar != scalar || key.parent != parent.number) {
        key.Become(scalar, parent.number);
        key.next = key.inside = {&Unknown(), &Unknown()};
    }
    guess.Take(key);
    return key;
}

} // namespace ovrin_yaml
