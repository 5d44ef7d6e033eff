#include "Diff/RulesReader.h"

#include "Diff/MergeRules.h"

#include <algorithm>
#include <istream>
#include <limits>
#include <stdexcept>

namespace ovrin_yaml {

namespace {

/// Appends the pieces of `text` between separators to `tokens`, empty ones left out.
void Tokenize(const std::string& text, char separator, std::vector<std::string>& tokens) {
    for (std::size_t begin = 0, end; begin < text.size(); begin = end + 1) {
        end = std::min(text.find(separator, begin), text.size());
        if (end > begin) tokens.push_back(text.substr(begin, end - begin));
    }
}

class RulesReader {
public:
    explicit RulesReader(MergeRules& rules) : m_Rules(rules) {}

    void ReadLine(const std::string& line);

private:
    enum class Section { None, Arrays, Exclusions, Comparisons, Premerge };

    bool OpenSection();
    void ReadRule();
    void ReadArrayRule() const;
    void ReadExclusionRule() const;
    void ReadComparisonRule() const;
    void ReadPremergeRule() const;
    /// The field paths behind action and path.
    std::vector<Path> FieldPaths() const;
    float FloatToken(std::size_t index) const { return YAMLScalar::Lookup(m_Tokens[index])->GetFloatValue(); }
    void Require(bool condition, const char* message) const;

    MergeRules& m_Rules;
    Section m_Section = Section::None;
    int m_LineNumber = 0;
    std::vector<std::string> m_Tokens; // of the current line
};

void RulesReader::ReadLine(const std::string& line) {
    ++m_LineNumber;
    if (line.starts_with('#')) return;
    m_Tokens.clear();
    Tokenize(line, ' ', m_Tokens);
    if (!m_Tokens.empty() && !OpenSection()) ReadRule();
}

bool RulesReader::OpenSection() {
    static const std::pair<const char*, Section> headers[] = {{"[arrays]", Section::Arrays},
                                                              {"[exclusions]", Section::Exclusions},
                                                              {"[comparisons]", Section::Comparisons},
                                                              {"[premerge]", Section::Premerge}};
    for (const auto& [header, section] : headers) {
        if (m_Tokens[0] != header) continue;
        m_Section = section;
        return true;
    }
    return false;
}

void RulesReader::ReadRule() {
    switch (m_Section) {
    case Section::None:
        return Require(false, "Rules file must specify section before any rules e.g. [arrays]. at line ");
    case Section::Arrays:
        return ReadArrayRule();
    case Section::Exclusions:
        return ReadExclusionRule();
    case Section::Comparisons:
        return ReadComparisonRule();
    case Section::Premerge:
        return ReadPremergeRule();
    }
    throw std::runtime_error("This cannot happen");
}

void RulesReader::ReadArrayRule() const {
    Require(m_Tokens.size() >= 2, "Invalid rule format at line ");
    const bool set = m_Tokens[0] == "set";
    Require(set || m_Tokens[0] == "plain", "Invalid rule format missing action at line ");
    Require(!set || m_Tokens.size() > 2, "Invalid format of unique key specification at line ");
    const SequenceType type = set ? SequenceType::Set : SequenceType::Plain;
    m_Rules.AddSequenceUniqueKeys(type, ToRulePath(m_Tokens[1]), FieldPaths());
}

void RulesReader::ReadExclusionRule() const {
    Require(m_Tokens.size() >= 2, "Invalid rule format at line ");
    const std::string& action = m_Tokens[0];
    const bool exclude = action.starts_with("exclude");
    const bool conditional = action == "includeIfContains" || action == "excludeIfContains";
    Require(conditional || action == "include" || action == "exclude",
            "Invalid format of excluded key specification at line ");
    Require(!conditional || m_Tokens.size() > 2,
            "Invalid format of excludeIfContains specification at line ");
    if (conditional)
        m_Rules.AddExclusionIfContainsFieldPath(ToRulePath(m_Tokens[1]), FieldPaths(), exclude);
    else
        m_Rules.AddExclusionFieldPath(ToRulePath(m_Tokens[1]), exclude);
}

void RulesReader::ReadComparisonRule() const {
    Require(m_Tokens.size() >= 2 && m_Tokens.size() <= 4, "Invalid rule format at line ");
    Require(m_Tokens[0] == "float", "Invalid rule format missing action at line ");
    const float relative = m_Tokens.size() > 2 ? FloatToken(2) : std::numeric_limits<float>::epsilon();
    const float absolute = m_Tokens.size() > 3 ? FloatToken(3) : relative;
    m_Rules.AddComparisonFieldPath(ToRulePath(m_Tokens[1]), relative, absolute);
}

void RulesReader::ReadPremergeRule() const {
    Require(m_Tokens.size() == 1, "Invalid rule format at line ");
    Require(m_Tokens[0] == "legacyBlankPremergeBase", "Invalid rule format missing action at line ");
    m_Rules.EnableBlankPremergeBase();
}

std::vector<Path> RulesReader::FieldPaths() const {
    std::vector<Path> paths;
    for (std::size_t i = 2; i < m_Tokens.size(); ++i) paths.push_back(ToRulePath(m_Tokens[i]));
    return paths;
}

void RulesReader::Require(bool condition, const char* message) const {
    if (!condition) throw std::runtime_error(message + std::to_string(m_LineNumber) + "\n");
}

} // namespace

Path ToRulePath(const std::string& text) {
    std::vector<std::string> elements;
    Tokenize(text, '.', elements);
    Path path;
    for (const std::string& element : elements) path.push_back(YAMLScalar::Lookup(element));
    return path;
}

void LoadSequenceUniqueKeys(std::istream& in, MergeRules& rules) {
    RulesReader reader(rules);
    for (std::string line; std::getline(in, line);) reader.ReadLine(line);
}

} // namespace ovrin_yaml
