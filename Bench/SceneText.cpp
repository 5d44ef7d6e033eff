#include "SceneText.h"

#include <cstring>

namespace ovrin_bench {
namespace {

constexpr std::size_t kLineWidth = 80; // a line is broken at the first chance behind this column

bool IsSpaceOrEnd(const std::string& text, std::size_t at) {
    return at >= text.size() || text[at] == ' ' || text[at] == '\t' || text[at] == '\n';
}

struct ScalarTraits {
    bool plainInBlock = true;
    bool plainInFlow = true;
    bool singleQuoted = true;
};

void ForbidPlain(ScalarTraits& traits) {
    traits.plainInBlock = traits.plainInFlow = false;
}

void LookAtIndicators(const std::string& text, ScalarTraits& traits) {
    if (text.starts_with("---") || text.starts_with("...")) ForbidPlain(traits);
    if (std::strchr("#,[]{}&*!|>'\"%@`", text[0]) || (text[0] == '-' && IsSpaceOrEnd(text, 1)))
        ForbidPlain(traits);
    for (std::size_t i = 0; i < text.size(); ++i) {
        bool endsWord = IsSpaceOrEnd(text, i + 1);
        if (text[i] == ':' || (text[i] == '?' && i == 0)) {
            traits.plainInFlow = false;
            if (endsWord) traits.plainInBlock = false;
        }
        if (i > 0 && std::strchr(",?[]{}", text[i])) traits.plainInFlow = false;
        if (i > 0 && text[i] == '#' && IsSpaceOrEnd(text, i - 1)) ForbidPlain(traits);
    }
}

ScalarTraits Classify(const std::string& text) {
    ScalarTraits traits;
    if (text.empty()) {
        traits.plainInFlow = false;
        return traits;
    }
    LookAtIndicators(text, traits);
    if (std::strchr(" \n", text.front()) || std::strchr(" \n", text.back())) ForbidPlain(traits);
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '\n') ForbidPlain(traits);
        bool special = (text[i] < ' ' && text[i] != '\n') || text[i] > '~';
        bool blankMeetsBreak =
            i > 0 && ((text[i - 1] == ' ' && text[i] == '\n') || (text[i - 1] == '\n' && text[i] == ' '));
        if (!special && !blankMeetsBreak) continue;
        ForbidPlain(traits);
        traits.singleQuoted = false;
    }
    return traits;
}

/// Writes values behind a growing text. An indent is that of the collection a value stands in.
class Writer {
public:
    explicit Writer(std::string& out) : m_Out(out), m_LineStart(out.size()) {}

    /// The entries of a block mapping; the first one continues the current line if `inlineFirst`.
    void BlockEntries(const SceneValue& mapping, int indent, bool inlineFirst) {
        for (std::size_t i = 0; i < mapping.items.size(); ++i) {
            if (i > 0 || !inlineFirst) NewLine(indent);
            m_Out += mapping.keys[i];
            m_Out += ':';
            EntryValue(mapping.items[i], indent);
        }
    }

    void NewLine(int indent) {
        Break();
        m_Out.append(indent, ' ');
    }

private:
    std::size_t Column() const { return m_Out.size() - m_LineStart; }

    void Break() {
        m_Out += '\n';
        m_LineStart = m_Out.size();
    }

    void EntryValue(const SceneValue& value, int indent) {
        if (value.kind == SceneValue::Kind::Text || value.flow || value.items.empty())
            InlineValue(value, indent, false);
        else if (value.kind == SceneValue::Kind::Mapping)
            BlockEntries(value, indent + 2, false);
        else
            for (const SceneValue& item : value.items) ListItem(item, indent);
    }

    void ListItem(const SceneValue& item, int indent) {
        NewLine(indent);
        m_Out += '-';
        if (item.kind == SceneValue::Kind::Mapping && !item.flow && !item.items.empty()) {
            m_Out += ' ';
            BlockEntries(item, indent + 2, true);
        } else {
            InlineValue(item, indent, false);
        }
    }

    /// A text or flow collection behind a blank on the current line.
    void InlineValue(const SceneValue& value, int indent, bool inFlow) {
        m_Out += ' ';
        if (value.kind == SceneValue::Kind::Text)
            Scalar(value.text, indent + 2, inFlow);
        else
            FlowCollection(value, indent + 2);
    }

    void FlowCollection(const SceneValue& value, int indent) {
        bool isMapping = value.kind == SceneValue::Kind::Mapping;
        m_Out += isMapping ? '{' : '[';
        for (std::size_t i = 0; i < value.items.size(); ++i) {
            if (i > 0) m_Out += ',';
            bool wrapped = Column() > kLineWidth;
            if (wrapped) NewLine(indent);
            if (isMapping) {
                if (i > 0 && !wrapped) m_Out += ' ';
                m_Out += value.keys[i];
                m_Out += ':';
                InlineValue(value.items[i], indent, true);
            } else {
                if (i > 0 && !wrapped) m_Out += ' ';
                Scalar(value.items[i].text, indent + 2, true);
            }
        }
        m_Out += isMapping ? '}' : ']';
    }

    void Scalar(const std::string& text, int foldIndent, bool inFlow) {
        ScalarTraits traits = Classify(text);
        if (inFlow ? traits.plainInFlow : traits.plainInBlock)
            Plain(text, foldIndent);
        else if (traits.singleQuoted)
            SingleQuoted(text, foldIndent);
        else
            DoubleQuoted(text, foldIndent);
    }

    /// A blank is a place to break a line if the line is full and the blank stands alone.
    bool Folds(const std::string& text, std::size_t at) const {
        return text[at] == ' ' && Column() > kLineWidth && at > 0 && text[at - 1] != ' ' &&
               at + 1 < text.size();
    }

    void Plain(const std::string& text, int foldIndent) {
        for (std::size_t i = 0; i < text.size(); ++i) {
            if (Folds(text, i) && text[i + 1] != ' ')
                NewLine(foldIndent);
            else
                m_Out += text[i];
        }
    }

    void SingleQuoted(const std::string& text, int foldIndent) {
        m_Out += '\'';
        for (std::size_t i = 0; i < text.size(); ++i) {
            bool behindBreak = i > 0 && text[i - 1] == '\n';
            if (text[i] == '\n') {
                if (!behindBreak) Break(); // one line end would read as a blank
                Break();
                continue;
            }
            if (behindBreak) m_Out.append(foldIndent, ' ');
            if (Folds(text, i) && text[i + 1] != ' ') {
                NewLine(foldIndent);
                continue;
            }
            if (text[i] == '\'') m_Out += '\'';
            m_Out += text[i];
        }
        m_Out += '\'';
    }

    void DoubleQuoted(const std::string& text, int foldIndent) {
        m_Out += '"';
        for (std::size_t i = 0; i < text.size(); ++i) {
            if (Folds(text, i)) {
                NewLine(foldIndent);
                if (text[i + 1] == ' ') m_Out += '\\';
            } else {
                DoubleQuotedCharacter(text[i]);
            }
        }
        m_Out += '"';
    }

    void DoubleQuotedCharacter(char c) {
        if (c == '\t')
            m_Out += "\\t";
        else if (c == '\n')
            m_Out += "\\n";
        else if (c == '"' || c == '\\')
            (m_Out += '\\') += c;
        else
            m_Out += c;
    }

    std::string& m_Out;
    std::size_t m_LineStart;
};

} // namespace

const char* const kFileHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

SceneValue& SceneValue::Add(std::string key, SceneValue value) {
    keys.push_back(std::move(key));
    items.push_back(std::move(value));
    return *this;
}

const SceneValue* SceneValue::Find(const std::string& key) const {
    for (std::size_t i = 0; i < keys.size(); ++i)
        if (keys[i] == key) return &items[i];
    return nullptr;
}

SceneValue* SceneValue::Find(const std::string& key) {
    return const_cast<SceneValue*>(std::as_const(*this).Find(key));
}

SceneValue Text(std::string text) {
    SceneValue value;
    value.text = std::move(text);
    return value;
}

SceneValue Mapping() {
    SceneValue value;
    value.kind = SceneValue::Kind::Mapping;
    return value;
}

SceneValue List() {
    SceneValue value;
    value.kind = SceneValue::Kind::List;
    return value;
}

SceneValue FlowMapping(std::vector<std::pair<std::string, std::string>> entries) {
    SceneValue value = Mapping();
    value.flow = true;
    for (auto& [key, text] : entries) value.Add(std::move(key), Text(std::move(text)));
    return value;
}

SceneValue Reference(std::int64_t id) {
    return FlowMapping({{"fileID", std::to_string(id)}});
}

std::string WrittenForm(const SceneObject& object) {
    std::string out = "--- !o!" + std::to_string(object.classID) + " &" + std::to_string(object.id);
    out += object.stripped ? " stripped\n" : "\n";
    out += object.className + ":";
    Writer(out).BlockEntries(object.fields, 2, false);
    out += '\n';
    return out;
}

} // namespace ovrin_bench
