#include "SmallChecks.h"

#include "ReaderCheck.h"

#include "Reading/ObjectFileReader.h"
#include "Repair/YAMLTypeInfo.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"
#include "Writing/ObjectFileWriter.h"

#include <algorithm>
#include <sstream>
#include <stdexcept>

using namespace ovrin_yaml;

namespace ovrin_fuzz {

namespace {

std::string FileOf(std::string_view input) {
    if (input.starts_with('%')) return std::string(input);
    return std::string(kFileHeader) + "--- !o!1 &1\nMergeTypeInfo:\n" + std::string(input);
}

std::string Shown(const std::vector<const YAMLScalar*>& ids) {
    std::string text;
    for (const YAMLScalar* id : ids) (text += ' ') += id->Value();
    return text;
}

std::string Shown(const YAMLTypeInfo& type) {
    return std::string(type.m_ID->Value()) + " " + std::string(type.m_BaseID->Value()) + " " +
           std::string(type.m_Name->Value()) + (type.m_IsMulti ? " multi" : "") + " requires" +
           Shown(type.m_Requires) + " conflicts" + Shown(type.m_Conflicts) + "\n";
}

bool IsAscending(const std::vector<const YAMLScalar*>& ids) {
    return std::adjacent_find(ids.begin(), ids.end(), [](const YAMLScalar* a, const YAMLScalar* b) {
               return a->GetIntValue() >= b->GetIntValue();
           }) == ids.end();
}

/// The types in the order of the file, or the failure. A set that isn't ascending is told of in `finding`.
std::string Read(const OvrinObjects& objects, YAMLTypeInfoManager& manager, std::string& finding) {
    try {
        manager.Read(objects);
    } catch (const std::runtime_error& error) {
        if (manager.IsLoaded()) finding = "types of a file that failed: " + std::string(error.what());
        return error.what();
    } catch (const YAMLError& error) {
        return error.what();
    }
    std::string shown;
    const YAMLMapping& object = *AsMapping(objects.GetMapping().Get(YAMLScalar::one));
    for (const YAMLNode* item : AsSequence(object.Get(YAMLScalar::mergeTypeInfo))->m_Items) {
        const YAMLScalar* id = AsScalar(AsMapping(item)->Get(YAMLScalar::mergeTypeInfoPersistentTypeID));
        const YAMLTypeInfo* type = manager.GetTypeInfo(id);
        if (!type) return finding = "no type " + std::string(id->Value());
        if (!IsAscending(type->m_Requires) || !IsAscending(type->m_Conflicts))
            finding = "a set that isn't ascending: " + Shown(*type);
        shown += Shown(*type);
    }
    return shown;
}

/// Reads a file into objects; false if it is none.
bool Parse(const std::string& file, bool fast, OvrinObjects& objects) {
    ReaderOptions options;
    options.fast = fast;
    try {
        ParseYAMLFile(std::string(file), objects, options);
    } catch (const YAMLError&) {
        return false;
    }
    return true;
}

bool Write(const OvrinObjects& objects, std::string& text) {
    std::ostringstream stream;
    try {
        Output(objects, stream);
    } catch (const YAMLError&) { // of repeated keys in some other object
        return false;
    }
    text = stream.str();
    return true;
}

} // namespace

std::string CheckTypeInfo(std::string_view input) {
    const std::string file = FileOf(input);
    OvrinObjects objects, plain, rewritten;
    if (!Parse(file, true, objects)) return "";
    std::string finding, written;
    YAMLTypeInfoManager manager;
    const std::string types = Read(objects, manager, finding);
    if (Read(objects, manager, finding) != types) return "other types when they are read again:\n" + types;
    if (!Parse(file, false, plain) || Read(plain, manager, finding) != types)
        return "other types through the library:\n" + types;
    if (!Write(objects, written)) return finding;
    if (!Parse(written, true, rewritten) || Read(rewritten, manager, finding) != types)
        return "other types once written:\n" + types + written;
    return finding;
}

} // namespace ovrin_fuzz
