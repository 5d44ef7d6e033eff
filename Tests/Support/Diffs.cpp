#include "Support/Diffs.h"

#include "Diff/CreateDiffOperation.h"
#include "Diff/DiffContext.h"
#include "Diff/RulesReader.h"

#include <sstream>

namespace diffs {

MergeRules& TheRules() {
    static MergeRules rules;
    return rules;
}

std::string Describe(const YAMLSequenceRemapper* remapper) {
    if (!remapper) return "=";
    std::string text;
    for (const int target : remapper->m_Mapping) text += std::to_string(target) + " ";
    return text + (remapper->m_IsSet ? ">" : "~>") + std::to_string(remapper->m_DestinationCount);
}

std::string Describe(const YAMLSequenceDiff* diff) {
    std::string text;
    for (const auto& [index, operation] : diff->Entries())
        text += (text.empty() ? "" : "; ") + std::to_string(index) + Describe(operation);
    return text;
}

std::string Describe(const YAMLMappingDiff* diff, bool withKeyOrder) {
    std::string text;
    for (const auto& [key, operation] : diff->Entries())
        text += (text.empty() ? "" : "; ") + std::string(key->Value()) + Describe(operation);
    if (!withKeyOrder || !diff->m_KeyOrder) return text;
    return "keys" + Describe(diff->m_KeyOrder) + " " + text;
}

std::string Describe(const Operation* operation) {
    if (!operation) return " none";
    const std::string mark = operation->m_Mergeable ? " " : "! ";
    switch (operation->GetKind()) {
    case Operation::Kind::Remove:
        return mark + "delete";
    case Operation::Kind::Change:
        return " change " + Show(As<ChangeOperation>(operation)->m_Value);
    case Operation::Kind::Add:
        return mark + "add " + Show(As<AddOperation>(operation)->m_Value);
    case Operation::Kind::ChangeMapping:
        return mark + "(" + Describe(As<ChangeMappingOperation>(operation)->m_Diff) + ")";
    case Operation::Kind::ChangeSequence:
        break;
    }
    const auto* sequence = As<ChangeSequenceOperation>(operation);
    const std::string inside = Describe(sequence->m_Diff);
    return mark + "[" + Describe(sequence->m_Remapper) + (inside.empty() ? "" : ": " + inside) + "]";
}

const Operation* OperationOf(const std::string& path, const std::string& base, const std::string& dest) {
    DiffContext context(TheRules(), PathOf(path));
    const auto node = [](const std::string& text) { return text.empty() ? nullptr : Node(text); };
    return CreateDiffOperation(context, node(base), node(dest));
}

void RulesTest::Rules(const std::string& text) {
    TheRules() = {};
    std::istringstream stream(text);
    LoadSequenceUniqueKeys(stream, TheRules());
}

} // namespace diffs
