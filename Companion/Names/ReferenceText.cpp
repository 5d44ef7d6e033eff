#include "Names/ReferenceText.h"

#include "Names/ObjectLabel.h"
#include "Names/PrintableText.h"

namespace ovrin {

using namespace ovrin_yaml;

bool IsReference(const YAMLNode& value) {
    static const YAMLScalar* const type = YAMLScalar::Lookup("type");
    const YAMLMapping* mapping = AsMapping(&value);
    if (!mapping || mapping->HasDuplicates() || !AsScalar(mapping->Get(YAMLScalar::fileID))) return false;
    for (const YAMLMapping::Entry entry : *mapping) {
        const bool isKnown =
            entry.key == YAMLScalar::fileID || entry.key == YAMLScalar::guid || entry.key == type;
        if (!isKnown || !AsScalar(entry.value)) return false;
    }
    return true;
}

std::string ReferenceText(const Reference& reference, const ObjectNames& names) {
    if (!reference.guid) return reference.IsNone() ? "none" : "→ " + names.NameWithID(reference.fileID);
    return "→ file " + ShortGuid(reference.guid) + " (" + Printable(reference.fileID->Value()) + ")";
}

} // namespace ovrin
