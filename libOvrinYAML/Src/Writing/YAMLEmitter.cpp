#include "Writing/YAMLEmitter.h"

#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"
#include "Writing/ScalarWriter.h"
#include "Writing/WrittenForm.h"

#include <algorithm>

namespace ovrin_yaml {

namespace {

/// Around the root, so that a block collection there comes to stand at column 0.
constexpr int kOutsideRoot = -kIndentStep;

bool IsSimpleKey(std::string_view key, ScalarForms forms) {
    return !forms.lineBreaks && key.size() <= kLongestSimpleKey;
}

bool IsEmpty(const YAMLMapping::Pairs& pairs) {
    for (const YAMLMapping::Entry pair : pairs)
        if (pair.key) return false;
    return true;
}

/// Indentation of a flow collection, and of the lines that a scalar folds into. Even at the root that is a
/// step.
int ContinuationIndent(int outer) {
    return std::max(outer + kIndentStep, kIndentStep);
}

std::string_view TextOf(const YAMLNode& node) {
    return static_cast<const YAMLScalar&>(node).Value();
}

} // namespace

void YAMLEmitter::EmitDocument(const YAMLNode& root) {
    EmitBlockNode(root, kOutsideRoot, Behind::Nothing);
    if (root.GetKind() == YAMLNode::Kind::Scalar &&
        FormsOf(static_cast<const YAMLScalar&>(root)).plainInBlock) {
        m_Output.Break(0);
        m_Output.Put(kDocumentEnd);
    }
    m_Output.Finish();
}

void YAMLEmitter::EmitDocument(const Pairs& pairs, bool flow) {
    if (flow || IsEmpty(pairs))
        EmitFlowMapping(pairs, kOutsideRoot, Behind::Nothing);
    else
        EmitBlockMapping(pairs, kOutsideRoot, Behind::Nothing);
    m_Output.Finish();
}

void YAMLEmitter::EmitBlockNode(const YAMLNode& node, int outer, Behind behind) {
    if (const YAMLMapping* mapping = AsMapping(&node)) {
        const Pairs pairs = mapping->RawEntries();
        if (!mapping->m_Flow && !IsEmpty(pairs)) return EmitBlockMapping(pairs, outer, behind);
    } else if (const YAMLSequence* sequence = AsSequence(&node)) {
        if (!sequence->m_Flow && !sequence->m_Items.empty())
            return EmitBlockSequence(*sequence, outer, behind);
    } else {
        Separate(behind);
        const ScalarForms forms = FormsOf(static_cast<const YAMLScalar&>(node));
        return EmitScalar(TextOf(node), forms, forms.plainInBlock, outer);
    }
    EmitFlowNode(node, outer, behind);
}

void YAMLEmitter::EmitBlockMapping(const Pairs& pairs, int outer, Behind behind) {
    const int indent = outer + kIndentStep;
    for (const YAMLMapping::Entry pair : pairs) {
        if (!pair.key) continue;
        BeginBlockEntry(indent, behind);
        EmitBlockPair(pair, indent);
        behind = Behind::Text;
    }
}

void YAMLEmitter::EmitBlockPair(const YAMLMapping::Entry& pair, int indent) {
    const std::string_view key = pair.key->Value();
    const ScalarForms forms = FormsOf(*pair.key);
    if (IsSimpleKey(key, forms)) {
        EmitSimpleKey(key, forms, forms.plainInBlock);
        m_Output.Put(':');
        EmitBlockNode(*pair.value, indent, Behind::Text);
    } else {
        m_Output.Put("? ");
        EmitScalar(key, forms, forms.plainInBlock, indent);
        m_Output.Break(indent);
        m_Output.Put(':');
        EmitBlockNode(*pair.value, indent, Behind::Indicator);
    }
}

void YAMLEmitter::EmitBlockSequence(const YAMLSequence& sequence, int outer, Behind behind) {
    const int indent = behind == Behind::Text ? outer : outer + kIndentStep;
    for (const YAMLNode* item : sequence.m_Items) {
        BeginBlockEntry(indent, behind);
        m_Output.Put('-');
        EmitBlockNode(*item, indent, Behind::Indicator);
        behind = Behind::Text;
    }
}

void YAMLEmitter::BeginBlockEntry(int indent, Behind behind) {
    if (behind == Behind::Text)
        m_Output.Break(indent);
    else
        Separate(behind);
}

void YAMLEmitter::EmitFlowNode(const YAMLNode& node, int outer, Behind behind) {
    if (const YAMLMapping* mapping = AsMapping(&node)) {
        EmitFlowMapping(mapping->RawEntries(), outer, behind);
    } else if (const YAMLSequence* sequence = AsSequence(&node)) {
        EmitFlowSequence(*sequence, outer, behind);
    } else {
        Separate(behind);
        const ScalarForms forms = FormsOf(static_cast<const YAMLScalar&>(node));
        EmitScalar(TextOf(node), forms, forms.plainInFlow, outer);
    }
}

void YAMLEmitter::EmitFlowMapping(const Pairs& pairs, int outer, Behind behind) {
    Separate(behind);
    m_Output.Put('{');
    const int indent = ContinuationIndent(outer);
    bool first = true;
    for (const YAMLMapping::Entry pair : pairs) {
        if (!pair.key) continue;
        EmitFlowPair(pair, indent, BeginFlowEntry(indent, first));
        first = false;
    }
    m_Output.Put('}');
}

void YAMLEmitter::EmitFlowPair(const YAMLMapping::Entry& pair, int indent, Behind behind) {
    const std::string_view key = pair.key->Value();
    const ScalarForms forms = FormsOf(*pair.key);
    Separate(behind);
    if (IsSimpleKey(key, forms)) {
        EmitSimpleKey(key, forms, forms.plainInFlow);
    } else {
        m_Output.Put("? ");
        EmitScalar(key, forms, forms.plainInFlow, indent);
        if (m_Output.IsBeyondWidth())
            m_Output.Break(indent);
        else
            m_Output.Put(' ');
    }
    m_Output.Put(':');
    EmitFlowNode(*pair.value, indent, Behind::Text);
}

void YAMLEmitter::EmitFlowSequence(const YAMLSequence& sequence, int outer, Behind behind) {
    Separate(behind);
    m_Output.Put('[');
    const int indent = ContinuationIndent(outer);
    bool first = true;
    for (const YAMLNode* item : sequence.m_Items) {
        EmitFlowNode(*item, indent, BeginFlowEntry(indent, first));
        first = false;
    }
    m_Output.Put(']');
}

YAMLEmitter::Behind YAMLEmitter::BeginFlowEntry(int indent, bool first) {
    if (!first) m_Output.Put(',');
    if (m_Output.IsBeyondWidth()) {
        m_Output.Break(indent);
        return Behind::Nothing;
    }
    return first ? Behind::Nothing : Behind::Text;
}

void YAMLEmitter::EmitSimpleKey(std::string_view key, ScalarForms forms, bool plainAllowed) {
    WriteScalar(m_Output, key, forms, plainAllowed && !key.empty(), {false, 0});
}

void YAMLEmitter::EmitScalar(std::string_view text, ScalarForms forms, bool plainAllowed, int outer) {
    WriteScalar(m_Output, text, forms, plainAllowed, {true, ContinuationIndent(outer)});
}

void YAMLEmitter::Separate(Behind behind) {
    if (behind != Behind::Nothing) m_Output.Put(' ');
}

std::string GetYAMLString(const YAMLNode& node) {
    std::string text;
    YAMLEmitter(text).EmitDocument(node);
    return text;
}

} // namespace ovrin_yaml
