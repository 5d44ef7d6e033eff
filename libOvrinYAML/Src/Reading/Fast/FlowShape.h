#pragma once

#include <array>
#include <cstddef>
#include <cstdint>
#include <cstring>
#include <string_view>

namespace ovrin_yaml {

/// What stands around the texts of a mapping in flow style that was read before: a mapping that has the same
/// around other texts has the same keys, and need not be read pair by pair.
///
///     {x: 1, y: -2}    shape "{x: " ", y: " "}"
///     {x: 0, y: 70}    the same shape: has the keys x and y once each
class FlowShape {
public:
    /// Of more pairs, or longer keys, no shape is made.
    static constexpr std::size_t kMostPairs = 4;
    static constexpr std::size_t kNone = SIZE_MAX;

    /// The shape of a mapping on one line, from bracket to bracket, that has nothing in it but plain keys and
    /// plain texts, with one blank between the parts. Of any other it is empty.
    static FlowShape Of(std::string_view mapping);

    /// Of pairs; 0 if it is empty.
    std::size_t Count() const { return m_Count; }
    /// The pair whose key is fileID, or kNone.
    std::size_t FileIDPair() const { return m_FileIDPair; }
    /// The end of what stands in front of the text of a pair, or behind the last one for Count(). Null if
    /// that isn't what stands at `position`, from where on kReadAhead bytes must be readable.
    const char* Match(std::size_t pair, const char* position) const {
        const Part& part = m_Parts[pair];
        std::uint64_t words[2];
        std::memcpy(words, position, sizeof words);
        const std::uint64_t differences =
            ((words[0] & part.masks[0]) ^ part.words[0]) | ((words[1] & part.masks[1]) ^ part.words[1]);
        return differences ? nullptr : position + part.length;
    }
    static constexpr std::size_t kReadAhead = 2 * sizeof(std::uint64_t);

    std::uint32_t facts = 0; ///< what the builder knows of such mappings

private:
    /// A text of up to 16 bytes, and which of their bits count.
    struct Part {
        std::uint64_t words[2] = {};
        std::uint64_t masks[2] = {};
        std::size_t length = 0;
    };

    bool AddPart(std::string_view text);

    std::array<Part, kMostPairs + 1> m_Parts;
    std::size_t m_PartCount = 0;
    std::size_t m_Count = 0;
    std::size_t m_FileIDPair = kNone;
};

/// The two shapes that were met last under a key, the later one first.
class FlowShapes {
public:
    const FlowShape& Latest() const { return m_Shapes[m_Latest]; }
    const FlowShape& Earlier() const { return m_Shapes[1 - m_Latest]; }
    void TakeEarlier() { m_Latest = 1 - m_Latest; }
    void Learn(const FlowShape& shape) {
        TakeEarlier();
        m_Shapes[m_Latest] = shape;
    }

private:
    std::array<FlowShape, 2> m_Shapes;
    std::size_t m_Latest = 0;
};

} // namespace ovrin_yaml
