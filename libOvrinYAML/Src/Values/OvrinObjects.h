#pragma once

#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"

#include <memory>
#include <string>

namespace ovrin_yaml {

/// Whether an object's entry under `key` holds data of its header line.
inline bool IsPlaceHolderKey(const YAMLScalar* key) {
    return key == YAMLScalar::fileIDPlaceHolderName || key == YAMLScalar::classIDPlaceHolderName ||
           key == YAMLScalar::strippedPrefabPlaceHolderName;
}

/// One object file: a root mapping from file-id scalar to object mapping, in file order.
///
/// An object mapping holds the body's keys (normally one, the class name) and behind them the header's data:
/// MERGE_FileID, MERGE_ClassID and, if the header line ended in " stripped", MERGE_StrippedPrefab.
/// An object is destroyed without giving back its tree: programs end soon after.
class OvrinObjects {
public:
    YAMLMapping& GetMapping() { return m_Root; }
    const YAMLMapping& GetMapping() const { return m_Root; }

    /// A copy, owned by the caller. The two share their objects from now on: each is copied by whoever
    /// changes it first, so that either may be changed while another thread uses the other. What was cloned
    /// before may be cloned on several threads at once. Throws the duplicate-keys text.
    OvrinObjects* Clone();

    /// Keeps the text that objects point into with their source bytes.
    void KeepText(std::shared_ptr<const std::string> text) { m_Text = std::move(text); }
    /// Keeps what makes the trees of objects that are unbuilt.
    void KeepMaker(std::shared_ptr<TreeMaker> maker) { m_Maker = std::move(maker); }

private:
    YAMLMapping m_Root;
    std::shared_ptr<const std::string> m_Text;
    std::shared_ptr<TreeMaker> m_Maker;
};

} // namespace ovrin_yaml
