#pragma once

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"

#include <cstddef>
#include <string_view>

namespace ovrin_yaml {

/// As find. Nearly all keys begin with "m_", so the search goes by the character behind that.
inline std::size_t FindKey(std::string_view text, std::string_view key) {
    constexpr std::size_t kTelling = 2;
    if (key.size() <= kTelling) return text.find(key);
    for (std::size_t at = kTelling; (at = text.find(key[kTelling], at)) != std::string_view::npos; ++at)
        if (text.substr(at - kTelling).starts_with(key)) return at - kTelling;
    return std::string_view::npos;
}

/// Whether an object may have, anywhere, a reference under `key` to a file id that isMeant(std::string_view)
/// tells of; under fileID itself stand all references. Of an object that is unbuilt the bytes are looked
/// through, so that it needn't be built for no; of any other the answer is yes.
///
/// Such bytes are in written form, in which a key stands as it is, and a reference nearly always as
///
///     m_Father: {fileID: 12}
///
/// Any other thing behind the key's text may mean what it likes: yes.
template <class IsMeant>
bool MayRefer(const YAMLMapping& object, const YAMLScalar& key, const IsMeant& isMeant) {
    const std::string_view reference = &key == YAMLScalar::fileID ? ": " : ": {fileID: ";
    constexpr std::string_view kDigits = "0123456789";
    if (object.IsBuilt()) return true;
    std::string_view rest = object.Source();
    for (std::size_t at; (at = FindKey(rest, key.Value())) != std::string_view::npos;) {
        rest.remove_prefix(at + key.Value().size());
        if (!rest.starts_with(reference)) return true;
        rest.remove_prefix(reference.size());
        const std::string_view id = rest.substr(0, rest.find_first_not_of(kDigits));
        const bool isWhole = rest.size() > id.size() && (rest[id.size()] == '}' || rest[id.size()] == ',');
        if (id.empty() || !isWhole || isMeant(id)) return true;
    }
    return false;
}

} // namespace ovrin_yaml
