#pragma once

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"

#include <string_view>

namespace ovrin_yaml {

/// Whether an object may have, anywhere, a reference under `key` to a file id that isMeant(const YAMLScalar*)
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
    for (std::size_t at; (at = rest.find(key.Value())) != std::string_view::npos;) {
        rest.remove_prefix(at + key.Value().size());
        if (!rest.starts_with(reference)) return true;
        rest.remove_prefix(reference.size());
        const std::string_view id = rest.substr(0, rest.find_first_not_of(kDigits));
        const bool isWhole = rest.size() > id.size() && (rest[id.size()] == '}' || rest[id.size()] == ',');
        if (id.empty() || !isWhole || isMeant(YAMLScalar::Lookup(id))) return true;
    }
    return false;
}

} // namespace ovrin_yaml
