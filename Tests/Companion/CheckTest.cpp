#include "Checks/Baseline.h"
#include "Checks/FindingLists.h"
#include "Checks/SceneCheck.h"

#include "SceneGenerator.h"
#include "Support/Program.h"

#include "Reading/ObjectFileReader.h"

#include <fstream>
#include <gtest/gtest.h>
#include <nlohmann/json.hpp>
#include <sstream>

namespace {

using namespace ovrin;
using nlohmann::json;

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string Object(int classID, int id, const std::string& body) {
    return "--- !o!" + std::to_string(classID) + " &" + std::to_string(id) + body;
}
std::string GameObject(int id, const std::string& components) {
    return Object(1, id, "\nGameObject:\n  m_Component:\n" + components + "  m_Name: Pier\n");
}
std::string Transform(int id, int gameObject, const std::string& children, int father) {
    return Object(4, id,
                  "\nTransform:\n  m_GameObject: {fileID: " + std::to_string(gameObject) +
                      "}\n  m_Children:" + children + "\n  m_Father: {fileID: " + std::to_string(father) +
                      "}\n");
}
std::string Entry(int id) {
    return "  - component: {fileID: " + std::to_string(id) + "}\n";
}
std::string Child(int id) {
    return "\n  - {fileID: " + std::to_string(id) + "}";
}

/// "code@line" of each finding.
std::string Findings(const std::string& bytes, const ovrin_yaml::YAMLTypeInfoManager& types = {}) {
    std::string told;
    for (const Finding& finding : CheckScene(bytes, types))
        told += (told.empty() ? "" : " ") + std::string(InfoOf(finding.code).name) + "@" +
                std::to_string(finding.line);
    return told;
}

TEST(Check, TellsWhatIsWrongAndWhere) {
    const std::string note = Object(9, 1, "\nNote:\n  m_Text: a\n");
    const struct {
        std::string objects, findings;
    } cases[] = {
        {"", ""},
        {GameObject(1, Entry(2)) + Transform(2, 1, Child(3), 0) + Transform(3, 0, " []", 2), ""},
        {note + note, "repeated-id@6"},
        {Object(9, 1, "\nNote:\n  a: 1\n  b: 2\n  a: 3\n"), "repeated-key@5"},
        {Object(9, 1, "\nAnimatorStateMachine:\n  m_StateMachineTransitions:\n    a: 1\n    a: 2\n"), ""},
        {Object(9, 1, "\nAnimatorStateMachine:\n  m_StateMachineTransitions:\n    a: 1\n    a: 1\n"),
         "not-as-written@3"},
        {Object(9, 1, "\nNote:\n  a: 1\n  a: 1\n"), "not-as-written@3"},
        {Object(9, 1, "\nNote:\n  a: 1\nMERGE_FileID: 1\nMERGE_ClassID: 7\n"), "repeated-key@3"},
        {Object(9, 1, "\nNote:\n  m_A: {fileID: 7}\n  m_B: {fileID: 7, guid: ab}\n  m_C: {fileID: 0}\n"),
         "dangling-reference@5"},
        {Transform(2, 0, " []", 0) + Transform(3, 0, " []", 2), "father-lacks-child@12"},
        {note + Transform(3, 0, " []", 1), "father-is-no-transform@10"},
        {Transform(2, 0, Child(3), 0) + Transform(3, 0, " []", 0), "child-of-another@7"},
        {Transform(2, 0, Child(3) + Child(3), 0) + Transform(3, 0, " []", 2), "repeated-child@8"},
        {Transform(2, 0, Child(3), 3) + Transform(3, 0, Child(2), 2), "parent-loop@8"},
        {Transform(2, 0, Child(2), 2), "parent-loop@8"},
        {GameObject(1, Entry(3)) + Transform(2, 1, " []", 0) + Transform(3, 1, " []", 0),
         "component-not-listed@10"},
        {note + Transform(3, 1, " []", 0), "owner-is-no-game-object@8"},
        {GameObject(1, Entry(2)) + GameObject(5, Entry(2)) + Transform(2, 5, " []", 0),
         "component-of-another@6"},
        {GameObject(1, Entry(2) + Entry(2)) + Transform(2, 1, " []", 0), "repeated-component@7"},
        {Object(9, 1, "\nNote:\n  m_Text: \"a\"\n"), "not-as-written@3"},
        {Object(9, 1, "\r\nNote:\r\n  m_Text: a\r\n"), "not-as-written@3"},
        {Object(9, 1, "\nNote:\n  m_Text: [a\n"), "unreadable@3"},
        {note + "=======\n", "conflict-markers@6"},
    };
    for (const auto& [objects, findings] : cases) EXPECT_EQ(Findings(kHeader + objects), findings) << objects;
}

TEST(Check, StrippedObjectsSayNothingOfTheirPlace) {
    const std::string stripped = " stripped\nTransform:\n  m_PrefabInternal: {fileID: 0}\n";
    EXPECT_EQ(
        Findings(kHeader + Object(4, 2, stripped) + Transform(3, 0, Child(4), 2) + Object(4, 4, stripped)),
        "");
}

TEST(Check, HeaderOfAnotherFormIsTold) {
    EXPECT_EQ(Findings("%YAML 1.1\n# by hand\n%TAG !o! tag:ovrin.dev,2011:\n--- !o!9 &1\nNote:\n  m_A: 1\n"),
              "not-as-written@4");
}

TEST(Check, MissingComponentsAreFoundByTypeInformation) {
    ovrin_yaml::OvrinObjects objects;
    ovrin_yaml::ParseYAMLString(
        kHeader + Object(9, 1,
                         "\nMergeTypeInfo:\n- id: 54\n  name: Body\n  ismulti: 0\n  baseid: 2\n"
                         "  requires: 41000000\n  conflicts: \n- id: 65\n  name: Collider\n  ismulti: 1\n"
                         "  baseid: 2\n  requires: \n  conflicts: \n"),
        objects);
    ovrin_yaml::YAMLTypeInfoManager types;
    types.Read(objects);
    const std::string body = Object(54, 2, "\nBody:\n  m_GameObject: {fileID: 1}\n");
    EXPECT_EQ(Findings(kHeader + GameObject(1, Entry(2)) + body, types), "missing-component@3");
    const std::string collider = Object(65, 3, "\nCollider:\n  m_GameObject: {fileID: 1}\n");
    EXPECT_EQ(Findings(kHeader + GameObject(1, Entry(2) + Entry(3)) + body + collider, types), "");
}

TEST(Check, GeneratedScenesAreClean) {
    ovrin_bench::SceneOptions options;
    options.size = 2000000;
    std::ostringstream base, left, right;
    ovrin_bench::GenerateScene(options, {base, left, right, nullptr});
    for (const auto* text : {&base, &left, &right}) EXPECT_EQ(Findings(text->str()), "");
}

/// The two ways to an outline: a key between quotes in a block leads to the second.
TEST(Check, SameFindingsWhereTheFastReaderIsNotSure) {
    const std::string objects = Transform(2, 8, Child(3) + Child(7), 0) + Transform(3, 0, " []", 9);
    const std::string found =
        "dangling-reference@5 child-of-another@7 dangling-reference@8 dangling-reference@14";
    EXPECT_EQ(Findings(kHeader + objects), found);
    EXPECT_EQ(Findings(kHeader + objects + Object(9, 1, "\nNote:\n  'a: b': 1\n")), found);
}

TEST(Check, HostileHierarchiesTakeLinearTime) {
    constexpr int kCount = 100000;
    std::string loop = kHeader, fan = kHeader, children;
    for (int id = 1; id <= kCount; ++id)
        loop += Transform(id, 0, Child(id % kCount + 1), (id + kCount - 2) % kCount + 1);
    for (int id = 2; id <= kCount; ++id) children += Child(id);
    fan += Transform(1, 0, children, 0);
    for (int id = 2; id <= kCount; ++id) fan += Transform(id, 0, " []", 1);
    EXPECT_EQ(Findings(loop), "parent-loop@8");
    EXPECT_EQ(Findings(fan), "");
    std::string keys = "\nNote:\n";
    for (int i = 0; i < 2 * kCount; ++i)
        keys += "  k" + std::to_string(i % kCount) + ": " + std::to_string(i) + '\n';
    EXPECT_EQ(CheckScene(kHeader + Object(9, 1, keys), {}).size(), std::size_t{kCount});
    std::string deep = "\nNote: ";
    for (int i = 0; i < 100000; ++i) deep += "[";
    EXPECT_EQ(Findings(kHeader + Object(9, 1, deep + "\n")), "unreadable@3");
}

TEST(Check, ListsAreValidWhateverTheBytes) {
    CheckedScenes result;
    result.scenes.push_back(
        {"a b/\xff\"#.ovrin", CheckScene(kHeader + Object(9, 1, "\nNote:\n  a: {fileID: \xff}\n"), {})});
    ASSERT_EQ(result.scenes[0].findings.size(), 1u);
    EXPECT_EQ(json::parse(ToJson(result)).at("findings").size(), 1u);
    const json run = json::parse(ToSarif(result)).at("runs")[0];
    const json found = run.at("results")[0];
    EXPECT_EQ(found.at("ruleId"),
              run.at("tool").at("driver").at("rules")[found.at("ruleIndex").get<std::size_t>()].at("id"));
    EXPECT_EQ(found.at("locations")[0].at("physicalLocation").at("artifactLocation").at("uri"),
              "a%20b/%FF%22%23.ovrin");
    EXPECT_EQ(ToLines(result).find("a b/\\xff\"#.ovrin:"), 0u);
}

TEST(Check, BaselineAcceptsWhatMovedAndNoMore) {
    const auto scene = [](const std::string& ahead, int times) {
        std::string body = ahead;
        for (int i = 0; i < times; ++i) body += "  - {fileID: 7}\n";
        return CheckedScene{"s.ovrin", CheckScene(kHeader + Object(9, 1, "\nNote:\n" + body), {})};
    };
    const program::WorkingDirectory directory;
    const std::string path = directory.Path() / "baseline";
    std::ofstream(path) << ToJson({.scenes = {scene("  m_List:\n", 2)}});
    Baseline baseline(path);
    CheckedScene moved = scene("  m_More: 1\n  m_List:\n", 3);
    baseline.Accept(moved);
    EXPECT_EQ(moved.findings.size(), 1u);
    EXPECT_EQ(baseline.Accepted(), 2u);
    EXPECT_EQ(baseline.Left(), 0u);
}

} // namespace
