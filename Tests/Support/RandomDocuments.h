#pragma once

#include <random>
#include <string>
#include <string_view>

/// Random bodies of objects as text: mostly in the form that the writer gives them, with every construct in
/// it, and now and then another that means something as well.
namespace random_documents {

class RandomDocuments {
public:
    explicit RandomDocuments(unsigned seed) : m_Random(seed) {}

    /// A block mapping with one class.
    std::string Body();
    /// The text with a few bytes changed, added or taken away, anywhere.
    std::string Damaged(std::string text);
    /// Printable characters.
    std::string Characters(std::size_t count);

private:
    std::size_t Below(std::size_t limit) { return m_Random() % limit; }
    template <std::size_t count> std::string_view OneOf(const std::string_view (&texts)[count]) {
        return texts[Below(count)];
    }
    std::string Key();
    void AddMapping(int indent, int depth);
    void AddValue(int indent, int depth);
    void AddItems(int indent, int depth);
    void AddScalar(int indent);
    void AddWords(int indent, std::string_view quote);
    void AddFlow(int indent, int depth);
    void AddFlowEntry(int indent, int depth);
    std::size_t Column() const { return m_Text.size() - (m_Text.rfind('\n') + 1); }

    std::mt19937 m_Random;
    std::string m_Text;
};

} // namespace random_documents
