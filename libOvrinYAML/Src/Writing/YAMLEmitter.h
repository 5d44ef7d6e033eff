#pragma once

#include "Values/YAMLMapping.h"
#include "Values/YAMLNode.h"
#include "Writing/ScalarStyle.h"
#include "Writing/TextOutput.h"

#include <string>
#include <string_view>

namespace ovrin_yaml {

class YAMLSequence;

/// Writes a value tree as YAML, byte for byte like the emitter of libyaml's 0.1 series on its defaults.
///
///     m_Component:                      block style, 2 columns a level
///     - component: {fileID: 4}          a list stands at the column of its key
///     m_Name:·                          a blank even before an empty value
///     m_Text: 'is: quoted'              quoted only if need be
///
/// One emitter writes one document, at the end of a text. No item of a sequence may be null.
class YAMLEmitter {
public:
    explicit YAMLEmitter(std::string& text) : m_Output(text) {}

    /// Write the document, without a final line break. Behind a root that is a plain scalar follows a line
    /// "...".
    void EmitDocument(const YAMLNode& root);
    /// The root is a mapping of `pairs`; those with a null key are passed over.
    void EmitDocument(const YAMLMapping::Pairs& pairs, bool flow);

private:
    using Pairs = YAMLMapping::Pairs;

    /// What stands before a node: all there is to know of the line.
    enum class Behind {
        Nothing,   // no blank is needed: line start or opening bracket
        Indicator, // "-" or ":" at the start of a line, where a block collection may begin as well
        Text       // a simple key's colon, an entry: a block collection begins a new line
    };

    // `outer` is the indentation of the enclosing collection.
    void EmitBlockNode(const YAMLNode& node, int outer, Behind behind);
    void EmitBlockMapping(const Pairs& pairs, int outer, Behind behind);
    void EmitBlockPair(const YAMLMapping::Entry& pair, int indent);
    void EmitBlockSequence(const YAMLSequence& sequence, int outer, Behind behind);
    void BeginBlockEntry(int indent, Behind behind);

    void EmitFlowNode(const YAMLNode& node, int outer, Behind behind);
    void EmitFlowMapping(const Pairs& pairs, int outer, Behind behind);
    void EmitFlowPair(const YAMLMapping::Entry& pair, int indent, Behind behind);
    void EmitFlowSequence(const YAMLSequence& sequence, int outer, Behind behind);
    Behind BeginFlowEntry(int indent, bool first);

    void EmitSimpleKey(std::string_view key, ScalarForms forms, bool plainAllowed);
    void EmitScalar(std::string_view text, ScalarForms forms, bool plainAllowed, int outer);
    void Separate(Behind behind);

    TextOutput m_Output;
};

/// The node as a YAML document of its own, without the final line break. Behind a plain scalar stands a line
/// "...".
std::string GetYAMLString(const YAMLNode& node);

} // namespace ovrin_yaml
