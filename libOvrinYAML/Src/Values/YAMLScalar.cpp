#include "Values/YAMLScalar.h"

#include "Values/ScalarTable.h"

#include <charconv>
#include <locale>
#include <sstream>

namespace ovrin_yaml {

YAMLScalar* const YAMLScalar::null = nullptr;
YAMLScalar* YAMLScalar::underscore;
YAMLScalar* YAMLScalar::empty;
YAMLScalar* YAMLScalar::zero;
YAMLScalar* YAMLScalar::one;
YAMLScalar* YAMLScalar::monoBehaviour;
YAMLScalar* YAMLScalar::mScript;
YAMLScalar* YAMLScalar::mFather;
YAMLScalar* YAMLScalar::transform;
YAMLScalar* YAMLScalar::rectTransform;
YAMLScalar* YAMLScalar::fileID;
YAMLScalar* YAMLScalar::star;
YAMLScalar* YAMLScalar::prefab;
YAMLScalar* YAMLScalar::prefabInstance;
YAMLScalar* YAMLScalar::mModification;
YAMLScalar* YAMLScalar::mTransformParent;
YAMLScalar* YAMLScalar::mPrefabInstance;
YAMLScalar* YAMLScalar::mPrefabInternal;
YAMLScalar* YAMLScalar::mPrefab;
YAMLScalar* YAMLScalar::guid;
YAMLScalar* YAMLScalar::fileIDPlaceHolderName;
YAMLScalar* YAMLScalar::classIDPlaceHolderName;
YAMLScalar* YAMLScalar::strippedPrefabPlaceHolderName;
YAMLScalar* YAMLScalar::mergeTypeInfo;
YAMLScalar* YAMLScalar::mergeTypeInfoPersistentTypeID;
YAMLScalar* YAMLScalar::mergeTypeInfoTypeName;
YAMLScalar* YAMLScalar::mergeTypeInfoIsMultiInstance;
YAMLScalar* YAMLScalar::mergeTypeInfoBasePersistentTypeID;
YAMLScalar* YAMLScalar::mergeTypeInfoRequires;
YAMLScalar* YAMLScalar::mergeTypeInfoConflicts;
YAMLScalar* YAMLScalar::gameObject;
YAMLScalar* YAMLScalar::mComponent;
YAMLScalar* YAMLScalar::mGameObject;

YAMLScalar* YAMLScalar::Lookup(std::string_view text, std::uint32_t line) {
    return ScalarTable::Instance().Intern(text, line);
}

void YAMLScalar::initializeConstants() {
    underscore = Lookup("_");
    empty = Lookup("");
    zero = Lookup("0");
    one = Lookup("1");
    monoBehaviour = Lookup("MonoBehaviour");
    mScript = Lookup("m_Script");
    mFather = Lookup("m_Father");
    transform = Lookup("Transform");
    rectTransform = Lookup("RectTransform");
    fileID = Lookup("fileID");
    star = Lookup("*");
    prefab = Lookup("Prefab");
    prefabInstance = Lookup("PrefabInstance");
    mModification = Lookup("m_Modification");
    mTransformParent = Lookup("m_TransformParent");
    mPrefabInstance = Lookup("m_PrefabInstance");
    mPrefabInternal = Lookup("m_PrefabInternal");
    mPrefab = Lookup("m_Prefab");
    guid = Lookup("guid");
    fileIDPlaceHolderName = Lookup("MERGE_FileID");
    classIDPlaceHolderName = Lookup("MERGE_ClassID");
    strippedPrefabPlaceHolderName = Lookup("MERGE_StrippedPrefab");
    mergeTypeInfo = Lookup("MergeTypeInfo");
    mergeTypeInfoPersistentTypeID = Lookup("id");
    mergeTypeInfoTypeName = Lookup("name");
    mergeTypeInfoIsMultiInstance = Lookup("ismulti");
    mergeTypeInfoBasePersistentTypeID = Lookup("baseid");
    mergeTypeInfoRequires = Lookup("requires");
    mergeTypeInfoConflicts = Lookup("conflicts");
    gameObject = Lookup("GameObject");
    mComponent = Lookup("m_Component");
    mGameObject = Lookup("m_GameObject");
}

namespace {

/// A stream and not strtol or strtof: those read "0x10", "inf" and out-of-range texts differently.
template <class Number> Number ExtractNumber(std::string_view text) {
    std::istringstream stream{std::string(text.substr(0, text.find('\0')))};
    stream.imbue(std::locale::classic());
    Number value{};
    stream >> value;
    return value;
}

} // namespace

int YAMLScalar::GetIntValue() const {
    return ExtractNumber<int>(Value());
}

float YAMLScalar::GetFloatValue() const {
    return ExtractNumber<float>(Value());
}

void initialize() {
    YAMLScalar::initializeConstants();
}

std::string IntToString(int value) {
    return std::to_string(value);
}

const YAMLScalar* IndexScalar(int index) {
    char text[12];
    const auto end = std::to_chars(text, text + sizeof text, index).ptr;
    return YAMLScalar::Lookup({text, static_cast<std::size_t>(end - text)});
}

} // namespace ovrin_yaml
