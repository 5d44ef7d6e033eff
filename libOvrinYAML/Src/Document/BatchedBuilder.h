#pragma once

#include "Document/ShortTextCache.h"
#include "Document/TreeBuilder.h"

#include <array>
#include <cstddef>
#include <cstdint>
#include <string_view>

namespace ovrin_yaml {

/// A TreeBuilder that interns its scalars many at a time.
///
/// Short texts that were met lately are found in a cache of the builder's own. All others wait, among the
/// steps that they belong to. When enough steps wait, the memory of all their scalars is asked for at once,
/// and then they are carried out:
///
///     noted      open | "m_X" | open flow | "fileID" | "12" | close | ...
///     loading    slots of all hashes, then the scalars in them
///     built      each text is interned from what is in the cache by now
class BatchedBuilder {
public:
    /// `text` must stay where it is until the tree is taken or the builder cleared, and so must what is
    /// readable behind it: `readable` bytes from its start on.
    void AddText(std::string_view text, std::size_t readable);
    void AddScalar(YAMLScalar* scalar);
    void Open(YAMLNode::Kind kind, bool flow, std::uint32_t line);
    void Close();

    /// Carries out what is noted and returns the finished tree, or null.
    YAMLNode* TakeRoot();
    bool IsRegular() const { return m_Builder.IsRegular(); }
    void Clear();

private:
    struct Step {
        enum class What : std::uint8_t { Text, Scalar, OpenMapping, OpenSequence, Close };
        What what;
        bool flow;
        bool isShort;         // Text: to be remembered
        std::uint32_t hash;   // Text
        std::uint32_t number; // length of a Text, line of a container
        union {
            const char* text;
            YAMLScalar* scalar;
        };
    };

    Step& Note(Step::What what);
    void Flush();
    void CarryOut(const Step& step);
    YAMLScalar* InternText(const Step& step);

    ShortTextCache m_ShortTexts;
    const char* m_ReadableEnd = nullptr; // of the texts that wait
    std::array<Step, 256> m_Steps;
    std::size_t m_Count = 0;
    TreeBuilder m_Builder;
};

} // namespace ovrin_yaml
