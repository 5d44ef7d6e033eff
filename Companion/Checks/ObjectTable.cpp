#include "Checks/ObjectTable.h"

#include "Repair/ObjectAccess.h"

namespace ovrin {

using ovrin_yaml::KeyIndex;
using ovrin_yaml::YAMLScalar;

ObjectTable::ObjectTable(const Outlines& outlines) : m_Outlines(outlines) {
    m_Index.Reserve(outlines.objects.size());
    for (std::size_t i = 0; i < outlines.objects.size(); ++i)
        if (m_Index.Find(outlines.objects[i].id) == KeyIndex::kMissing)
            m_Index.Set(outlines.objects[i].id, static_cast<std::uint32_t>(i));
}

bool IsTransform(const ObjectOutline& object) {
    return object.className == YAMLScalar::transform || object.className == YAMLScalar::rectTransform;
}

bool IsGameObject(const ObjectOutline& object) {
    return object.className == YAMLScalar::gameObject;
}

bool RefersToSomething(const YAMLScalar* target) {
    return !ovrin_yaml::IsNoReference(target);
}

} // namespace ovrin
