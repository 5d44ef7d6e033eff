#include "Checks/FaultWords.h"

#include "Names/PrintableText.h"

#include "Session/ReadInputs.h"

#include <algorithm>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

/// Of ids and keys, which may be of any length in a file that means harm.
constexpr std::size_t kLongestWord = 60;

std::string Word(const YAMLScalar* scalar) {
    return scalar ? ShortenedInMiddle(Printable(scalar->Value()), kLongestWord) : "";
}

/// The trees of a text that is in memory.
const YAMLMapping& ReadTrees(const std::string& text, OvrinObjects& objects) {
    const InputFile input = TextInput("the scene", text);
    ReadInputs({{"Read scene", &input, &objects}}, Threads::WhereWorthwhile);
    return objects.GetMapping();
}

/// Counts the lines of a text, onward from one place to the next.
class LineCounter {
public:
    explicit LineCounter(const std::string& text) : m_Text(text) {}

    /// The line that holds the byte at `position`, which isn't ahead of the one before.
    std::size_t At(std::size_t position) {
        m_Line +=
            static_cast<std::size_t>(std::count(m_Text.data() + m_Position, m_Text.data() + position, '\n'));
        m_Position = position;
        return m_Line;
    }

private:
    const std::string& m_Text;
    std::size_t m_Position = 0;
    std::size_t m_Line = 1;
};

} // namespace

FaultWords::FaultWords(const std::string& text, const Outlines& outlines, const YAMLTypeInfoManager& types)
    : m_Text(text), m_Types(types), m_Table(outlines), m_Names(ReadTrees(text, m_Objects)) {}

/// Faults come in the order of their objects, and so in that of the text.
std::vector<Finding> FaultWords::Tell(std::span<const ObjectFault> faults) {
    std::vector<Finding> findings;
    findings.reserve(faults.size());
    LineCounter lines(m_Text);
    for (const ObjectFault& fault : faults) {
        findings.push_back(TellOne(fault));
        findings.back().line = lines.At(m_Table.At(fault.object).begin) + fault.line;
    }
    return findings;
}

Finding FaultWords::TellOne(const ObjectFault& fault) {
    Finding finding{fault.code};
    finding.message = MessageOf(fault);
    // It is about the file, and its first object may be another one after the next change.
    if (fault.code == Code::NotAsWritten) return finding;
    const ID id = m_Table.At(fault.object).id;
    finding.object = Word(id);
    finding.name = NameOf(id);
    finding.detail = Word(fault.field);
    if (fault.other) finding.detail += (fault.field ? " " : "") + Word(fault.other);
    return finding;
}

std::string FaultWords::MessageOf(const ObjectFault& fault) {
    const std::string field = Word(fault.field);
    const auto other = [&] { return TargetName(fault.other); };
    switch (fault.code) {
    case Code::RepeatedId:
        return "has the id of an earlier object, " + Word(fault.other);
    case Code::RepeatedKey:
        return "has the key " + field + " more than once in one mapping";
    case Code::DanglingReference:
        return (field.empty() ? "refers" : field + " refers") + " to " + Word(fault.other) +
               ", and there is no such object";
    case Code::FatherLacksChild:
        return field + " is " + other() + ", whose m_Children lack it";
    case Code::FatherIsNoTransform:
        return field + " is " + other() + ", which is no Transform";
    case Code::ChildOfAnother:
        return field + " have " + other() + ", whose m_Father is " +
               TargetName(m_Table.Get(fault.other)->father);
    case Code::ComponentOfAnother:
        return field + " has " + other() + ", whose m_GameObject is " +
               TargetName(m_Table.Get(fault.other)->gameObject);
    case Code::RepeatedChild:
        return field + " have " + other() + " more than once";
    case Code::RepeatedComponent:
        return field + " has " + other() + " more than once";
    case Code::ParentLoop:
        return "is its own ancestor, in a loop of " + std::to_string(fault.number) + ": " + field + " is " +
               other();
    case Code::ComponentNotListed:
        return field + " is " + other() + ", whose m_Component lacks it";
    case Code::OwnerIsNoGameObject:
        return field + " is " + other() + ", which is no GameObject";
    case Code::MissingComponent:
        return "lacks a component " + TypeName(fault.other) + ", which another of its components requires";
    default:
        return "the text isn't in the form that is written; this is the first place";
    }
}

/// Objects of odd shapes take long to name.
const std::string& FaultWords::NameOf(ID id) {
    const auto [known, isNew] = m_Known.try_emplace(id);
    if (isNew) known->second = m_Names.Name(id);
    return known->second;
}

std::string FaultWords::TargetName(ID id) {
    return RefersToSomething(id) ? NameOf(id) + " (" + Word(id) + ')' : "none";
}

std::string FaultWords::TypeName(ID classID) const {
    const YAMLTypeInfo* type = m_Types.GetTypeInfo(classID);
    return type ? Word(type->m_Name) : "of class " + Word(classID);
}

} // namespace ovrin
