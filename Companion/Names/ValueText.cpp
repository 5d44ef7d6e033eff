#include "Names/ValueText.h"

#include "Names/PrintableText.h"
#include "Names/ReferenceText.h"

#include "Values/OvrinObjects.h"

#include <limits>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

bool NeedsQuotes(std::string_view text) {
    return text.empty() || text.front() == ' ' || text.back() == ' ' || text.front() == '"' ||
           text == "none" || text.starts_with("→");
}

bool NeedsQuotesInside(std::string_view text) {
    return NeedsQuotes(text) || text.find_first_of(",{}[]") != std::string_view::npos ||
           text.find(": ") != std::string_view::npos;
}

std::string Quoted(std::string_view text) {
    return '"' + std::string(text) + '"';
}

/// Writes a value in flow form, as far as there is room for it.
class Line {
public:
    /// Takes at least `characters` of them, if there are so many.
    Line(const ObjectNames& names, std::size_t characters)
        : m_Names(names), m_MostBytes(characters * kBytesOfCharacter) {}

    void Write(const YAMLNode* value) {
        if (IsFull() || !value) return;
        if (const YAMLScalar* scalar = AsScalar(value)) return WriteText(scalar->Value());
        if (IsReference(*value)) {
            m_Text += ReferenceText(ReferenceOf(value), m_Names);
        } else if (const YAMLMapping* mapping = AsMapping(value)) {
            WriteMapping(*mapping);
        } else {
            WriteList(value);
        }
    }
    void WriteText(std::string_view text) {
        const std::string printable = Printable(text.substr(0, m_MostBytes));
        m_Text += NeedsQuotesInside(text) ? Quoted(printable) : printable;
    }
    std::string Text() && { return std::move(m_Text); }

private:
    static constexpr std::size_t kBytesOfCharacter = 4;

    bool IsFull() const { return m_Text.size() > m_MostBytes; }

    void WriteMapping(const YAMLMapping& mapping) {
        const char* separator = "";
        m_Text += '{';
        for (const YAMLMapping::Entry entry : mapping.RawEntries()) {
            if (!entry.key || IsPlaceHolderKey(entry.key)) continue;
            if (IsFull()) break;
            m_Text += separator;
            WriteText(entry.key->Value());
            m_Text += ": ";
            Write(entry.value);
            separator = ", ";
        }
        m_Text += '}';
    }

    void WriteList(const YAMLNode* list) {
        const char* separator = "";
        m_Text += '[';
        for (const YAMLNode* item : ItemsOf(list)) {
            if (IsFull()) break;
            m_Text += separator;
            Write(item);
            separator = ", ";
        }
        m_Text += ']';
    }

    const ObjectNames& m_Names;
    const std::size_t m_MostBytes;
    std::string m_Text;
};

constexpr std::size_t kNoLimit = std::numeric_limits<std::size_t>::max() / 8;

std::string ScalarLine(std::string_view text, std::size_t width) {
    const std::string printable = Printable(width ? text.substr(0, 4 * (width + 1)) : text);
    return NeedsQuotes(text) ? Quoted(printable) : printable;
}

} // namespace

std::string ValueLine(const YAMLNode& value, const ObjectNames& names, std::size_t width) {
    if (const YAMLScalar* scalar = AsScalar(&value))
        return ShortenedAtEnd(ScalarLine(scalar->Value(), width), width);
    // The id at the end is what a reference can't do without.
    if (IsReference(value)) return ShortenedInMiddle(ReferenceText(ReferenceOf(&value), names), width);
    Line line(names, width ? width + 1 : kNoLimit);
    line.Write(&value);
    return ShortenedAtEnd(std::move(line).Text(), width);
}

} // namespace ovrin
