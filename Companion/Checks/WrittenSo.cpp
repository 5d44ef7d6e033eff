#include "Checks/WrittenSo.h"

#include "Reading/DocumentCut.h"
#include "Reading/ObjectFileReader.h"
#include "Values/OvrinObjects.h"
#include "Writing/ObjectFileWriter.h"

namespace ovrin {

using namespace ovrin_yaml;

bool IsWrittenSo(const YAMLScalar& id, const YAMLMapping& object, std::string_view document) {
    if (object.HasDuplicates()) return true;
    std::string written;
    AppendObject(id, object, written);
    return written == document;
}

bool FormSearch::IsFirst(std::string_view document, bool isSure) {
    if (isSure || m_IsFound) return false;
    if (!m_Reader) m_Reader.emplace(m_Text.data() + m_Text.size());
    const YAMLMapping* object = m_Reader->Read(document, 0).object;
    m_Reader->InternTexts();
    OvrinObjects objects;
    if (!object) { // transitions with repeated keys
        ParseYAMLString(std::string(FileHeaderOf(m_Text)).append(document), objects);
        object = AsMapping(objects.GetMapping().First());
    }
    m_IsFound = !IsWrittenSo(*AsScalar(object->Get(YAMLScalar::fileIDPlaceHolderName)), *object, document);
    return m_IsFound;
}

} // namespace ovrin
