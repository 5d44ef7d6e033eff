#include "Names/ValueLines.h"

#include "Names/PrintableText.h"
#include "Names/ReferenceText.h"
#include "Names/ValueText.h"

#include "Values/OvrinObjects.h"

namespace ovrin {

using namespace ovrin_yaml;

namespace {

class Block {
public:
    explicit Block(const ObjectNames& names) : m_Names(names) {}

    /// Writes a value behind `head`, which is on its line already: "key: ", "- " or nothing.
    void Write(const YAMLNode* value, std::size_t indent, const std::string& head) {
        if (const YAMLScalar* scalar = AsScalar(value)) return WriteText(*scalar, indent, head);
        if (!value || IsOnOneLine(*value)) {
            m_Lines.push_back(head + (value ? ValueLine(*value, m_Names) : ""));
            return;
        }
        if (const std::size_t end = head.find_last_not_of(' '); end != std::string::npos)
            m_Lines.push_back(head.substr(0, end + 1));
        WriteEntries(*value, head.empty() ? indent : indent + kStep);
    }
    std::vector<std::string> Lines() && { return std::move(m_Lines); }

private:
    static constexpr std::size_t kStep = 2;

    static bool IsOnOneLine(const YAMLNode& value) {
        if (const YAMLMapping* mapping = AsMapping(&value))
            return mapping->m_Flow || mapping->RawEntries().size() == 0 || IsReference(value);
        return AsSequence(&value)->m_Flow || ItemsOf(&value).empty();
    }

    void WriteText(const YAMLScalar& scalar, std::size_t indent, const std::string& head) {
        std::string_view text = scalar.Value();
        if (text.find('\n') == std::string_view::npos) {
            m_Lines.push_back(head + ValueLine(scalar, m_Names));
            return;
        }
        if (!head.empty()) m_Lines.push_back(head + "|");
        const std::string blanks(head.empty() ? indent : indent + kStep, ' ');
        for (std::size_t end = 0; end != std::string_view::npos;) {
            end = text.find('\n');
            m_Lines.push_back(blanks + Printable(text.substr(0, end)));
            text.remove_prefix(end == std::string_view::npos ? text.size() : end + 1);
        }
    }

    void WriteEntries(const YAMLNode& value, std::size_t indent) {
        const std::string blanks(indent, ' ');
        if (const YAMLMapping* mapping = AsMapping(&value)) {
            for (const YAMLMapping::Entry entry : mapping->RawEntries())
                if (entry.key && !IsPlaceHolderKey(entry.key))
                    Write(entry.value, indent, blanks + Printable(entry.key->Value()) + ": ");
        }
        for (const YAMLNode* item : ItemsOf(&value)) WriteItem(item, indent);
    }

    /// The first entry of a mapping or list stands behind the dash.
    void WriteItem(const YAMLNode* item, std::size_t indent) {
        const std::string dash = std::string(indent, ' ') + "- ";
        if (!item || AsScalar(item) || IsOnOneLine(*item)) return Write(item, indent, dash);
        const std::size_t first = m_Lines.size();
        WriteEntries(*item, indent + kStep);
        if (m_Lines.size() > first) m_Lines[first].replace(0, dash.size(), dash);
    }

    const ObjectNames& m_Names;
    std::vector<std::string> m_Lines;
};

} // namespace

std::vector<std::string> ValueLines(const YAMLNode& value, const ObjectNames& names) {
    Block block(names);
    block.Write(&value, 0, "");
    return std::move(block).Lines();
}

} // namespace ovrin
