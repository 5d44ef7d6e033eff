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

KnownKey& KnownKeys::PlaceOf(const KnownKey& parent, const YAMLScalar* scalar) {
    // Numbers, not addresses: what is guessed must not depend on them.
    const auto seed = static_cast<std::uint32_t>(&parent - m_Keys.data());
    const std::uint32_t first = (seed * 0x9e3779b1u ^ scalar->m_Hash) * 0x85ebca6bu >> (32 - kPlaceBits);
    KnownKey* place = &m_Keys[kFirstPlace + first];
    for (std::size_t left = kProbes; left > 1; --left, ++place)
        if (!place->scalar || (place->scalar == scalar && place->parent == &parent)) break;
    return *place;
}

KnownKey& KnownKeys::Learn(const KnownKey& parent, YAMLScalar* scalar, KeyGuess& guess) {
    KnownKey& key = PlaceOf(parent, scalar);
    if (key.scalar != scalar || key.parent != &parent) {
        const std::string_view text = scalar->Value();
        char start[8] = {};
        char mask[8] = {};
        std::memcpy(start, text.data(), std::min<std::size_t>(text.size(), 8));
        if (text.size() < 8) start[text.size()] = ':';
        std::memset(mask, 0xff, std::min<std::size_t>(text.size() + 1, 8));
        key = {.scalar = scalar,
               .word = KnownKey::Load(start),
               .wordMask = KnownKey::Load(mask),
               .length = static_cast<std::uint32_t>(text.size()),
               .hash = scalar->m_Hash,
               .parent = &parent,
               .next = {&Unknown(), &Unknown()},
               .inside = {&Unknown(), &Unknown()}};
    }
    guess.Take(key);
    return key;
}

} // namespace ovrin_yaml
