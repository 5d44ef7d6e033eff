#include "Repair/YAMLTypeInfo.h"

#include "Values/YAMLMapping.h"
#include "Values/YAMLSequence.h"

#include <stdexcept>
#include <string>

namespace ovrin_yaml {

namespace {

const YAMLScalar* ReadField(const YAMLMapping* mapping, const YAMLScalar* key) {
    const YAMLScalar* value = mapping ? AsScalar(mapping->Get(key)) : nullptr;
    if (!value)
        throw std::runtime_error("Cannot read " + std::string(key->Value()) + " in YAMLTypeInfo file\n");
    return value;
}

std::vector<const YAMLScalar*> ReadTypeIDs(const YAMLScalar& text) {
    std::set<int> numbers;
    ReadCompactSerializedSet(text.Value(), numbers);
    std::vector<const YAMLScalar*> ids;
    for (const int number : numbers) ids.push_back(YAMLScalar::Lookup(std::to_string(number)));
    return ids;
}

std::uint32_t DigitValue(unsigned char digit) {
    if (digit < ':') return digit - unsigned{'0'};
    return 10 + digit - (digit < '[' ? unsigned{'A'} : unsigned{'a'});
}

std::uint32_t ByteValue(char high, char low) {
    return (16 * DigitValue(high) + DigitValue(low)) & 0xffu;
}

} // namespace

void YAMLTypeInfo::Read(const YAMLMapping* mapping) {
    m_ID = ReadField(mapping, YAMLScalar::mergeTypeInfoPersistentTypeID);
    m_Name = ReadField(mapping, YAMLScalar::mergeTypeInfoTypeName);
    m_IsMulti = ReadField(mapping, YAMLScalar::mergeTypeInfoIsMultiInstance)->GetIntValue() == 1;
    m_BaseID = ReadField(mapping, YAMLScalar::mergeTypeInfoBasePersistentTypeID);
    const YAMLScalar* required = ReadField(mapping, YAMLScalar::mergeTypeInfoRequires);
    const YAMLScalar* conflicting = ReadField(mapping, YAMLScalar::mergeTypeInfoConflicts);
    m_Requires = ReadTypeIDs(*required);
    m_Conflicts = ReadTypeIDs(*conflicting);
}

void YAMLTypeInfoManager::Read(const OvrinObjects& objects) {
    Read(AsMapping(objects.GetMapping().Get(YAMLScalar::one)));
}

void YAMLTypeInfoManager::Read(const YAMLMapping* mapping) {
    m_Types.clear();
    m_IsLoaded = false;
    const YAMLScalar* const key = YAMLScalar::mergeTypeInfo;
    const YAMLSequence* list = mapping ? AsSequence(mapping->Get(key)) : nullptr;
    if (!list)
        throw std::runtime_error("Cannot find" + std::string(key->Value()) +
                                 " object in YAMLMapping provided\n");
    for (const YAMLNode* item : list->m_Items) {
        YAMLTypeInfo type;
        type.Read(AsMapping(item));
        m_Types.emplace(type.m_ID, type);
    }
    m_IsLoaded = true;
}

const YAMLTypeInfo* YAMLTypeInfoManager::GetTypeInfo(const YAMLScalar* id) const {
    const auto found = m_Types.find(id);
    return found == m_Types.end() ? nullptr : &found->second;
}

void ReadCompactSerializedSet(std::string_view text, std::set<int>& result) {
    constexpr std::size_t kGroup = 8;
    for (; text.size() >= kGroup; text.remove_prefix(kGroup)) {
        std::uint32_t number = 0;
        for (std::size_t i = 0; i < 4; ++i) number |= ByteValue(text[2 * i], text[2 * i + 1]) << (8 * i);
        result.insert(static_cast<int>(number));
    }
}

} // namespace ovrin_yaml
