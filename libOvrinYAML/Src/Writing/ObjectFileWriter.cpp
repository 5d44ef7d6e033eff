#include "Writing/ObjectFileWriter.h"

#include "Values/YAMLScalar.h"
#include "Writing/WrittenForm.h"
#include "Writing/YAMLEmitter.h"

#include <ostream>
#include <vector>

namespace ovrin_yaml {

namespace {

/// Text is handed to the stream in pieces of about this size: big enough to make calls cheap, small enough
/// to stay in the cache.
constexpr std::size_t kPieceSize = std::size_t{1} << 20;

constexpr std::string_view kTagAuthority = OVRIN_TAG_AUTHORITY;

void AppendHeaderLine(const YAMLScalar& rootKey, const YAMLMapping& object, std::string& text) {
    const YAMLScalar* fileID = AsScalar(object.Get(YAMLScalar::fileIDPlaceHolderName));
    const YAMLScalar* classID = AsScalar(object.Get(YAMLScalar::classIDPlaceHolderName));
    if (!fileID) fileID = &rootKey;
    if (!classID) throw YAMLError("Object has no class id: " + std::string(fileID->Value()));
    text.append(kDocumentStart).append(classID->Value()).append(kAnchor).append(fileID->Value());
    if (object.HasKey(YAMLScalar::strippedPrefabPlaceHolderName)) text.append(kStripped);
    text.push_back('\n');
}

} // namespace

void AppendObjectBody(const YAMLMapping& object, std::string& text) {
    std::vector<const YAMLScalar*> keys;
    std::vector<YAMLNode*> values;
    for (const YAMLMapping::Entry entry : object) {
        if (IsPlaceHolderKey(entry.key)) continue;
        keys.push_back(entry.key);
        values.push_back(entry.value);
    }
    YAMLEmitter(text).EmitDocument({keys.data(), values.data(), keys.size()}, object.m_Flow);
}

void AppendObject(const YAMLScalar& rootKey, const YAMLMapping& object, std::string& text) {
    AppendHeaderLine(rootKey, object, text);
    AppendObjectBody(object, text);
    text.push_back('\n');
}

std::string_view TagAuthority() {
    return kTagAuthority;
}

void Output(const OvrinObjects& objects, std::ostream& stream) {
    std::string text(kFileHeaderStart);
    text.append(kTagAuthority).append(kFileHeaderEnd);
    for (const YAMLMapping::Entry entry : objects.GetMapping()) {
        const YAMLMapping& object = ToMapping(entry.value);
        if (!object.Source().empty())
            text += object.Source();
        else
            AppendObject(*entry.key, object, text);
        if (text.size() < kPieceSize) continue;
        stream.write(text.data(), static_cast<std::streamsize>(text.size()));
        text.clear();
    }
    stream.write(text.data(), static_cast<std::streamsize>(text.size()));
    stream.flush();
}

} // namespace ovrin_yaml
