#include "Checks/Baseline.h"
#include "Checks/FindingCodes.h"
#include "Checks/FindingLists.h"
#include "Checks/SceneCheck.h"
#include "Checks/ScenesToCheck.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

#include <algorithm>
#include <nlohmann/json.hpp>
#include <random>
#include <set>

namespace {

using namespace ovrin;
using failures::ErrorOf;
using nlohmann::json;
using Names = std::vector<std::string>;

TEST(FindingCodes, NamesAreDifferentAndLeadBack) {
    std::set<std::string> names, titles;
    for (const CodeInfo& info : CodeTable()) {
        EXPECT_EQ(FindCode(info.name), &info);
        EXPECT_EQ(&InfoOf(info.code), &info);
        names.insert(info.name);
        titles.insert(info.title);
        EXPECT_EQ(std::string(info.name).find_first_not_of("abcdefghijklmnopqrstuvwxyz-"), std::string::npos);
        EXPECT_TRUE(std::string(info.explanation).ends_with('.')) << info.name;
    }
    EXPECT_EQ(names.size(), CodeTable().size());
    EXPECT_EQ(titles.size(), CodeTable().size());
    for (const char* name : {"", "Binary", "binary ", "nothing"}) EXPECT_EQ(FindCode(name), nullptr);
}

/// What is no scene at all, by its bytes.
TEST(SceneCheck, OtherBytesHaveOneFindingThatTellsWhatTheyAre) {
    const std::string header = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";
    const std::pair<std::string, const char*> cases[] = {
        {"", "empty"},
        {std::string("a\0b", 3), "binary"},
        {"text\n", "no-scene"},
        {"version https://git-lfs.github.com/spec/v1\noid sha256:" + std::string(64, 'a') + "\nsize 12345\n",
         "lfs-pointer"},
        {header + "<<<<<<< ours\n", "conflict-markers"},
        {header + "--- !o!1 &1\n\tA: 1\n", "unreadable"},
    };
    for (const auto& [bytes, name] : cases) {
        const std::vector<Finding> findings = CheckScene(bytes, {});
        ASSERT_EQ(findings.size(), 1u) << name;
        EXPECT_STREQ(InfoOf(findings[0].code).name, name);
    }
}

TEST(SceneCheck, NoPieceOfASceneEndsTheProgram) {
    const std::string scene =
        "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n--- !o!1 &1\nGameObject:\n  m_Component:\n"
        "  - component: {fileID: 2}\n  m_Name: \"a\\nb\"\n--- !o!4 &2 stripped\nTransform:\n"
        "  m_GameObject: {fileID: 1}\n  m_Children: []\n  m_Father: {fileID: 0}\n";
    std::mt19937 random(2);
    for (std::size_t length = 0; length <= scene.size(); ++length) {
        std::string bytes = scene.substr(0, length);
        CheckScene(bytes, {});
        if (length) bytes[random() % length] = "\n -{}[]:&!\"'\0\xff"[random() % 14];
        for (const Finding& finding : CheckScene(bytes, {}))
            EXPECT_LE(finding.line, static_cast<std::size_t>(std::ranges::count(bytes, '\n')) + 1);
    }
}

/// Findings of all codes, in files of odd names.
CheckedScenes AllFindings() {
    CheckedScenes result;
    for (const CodeInfo& info : CodeTable())
        result.scenes.push_back({std::string(info.name) + " \"\xff\n.ovrin",
                                 {{.code = info.code, .line = 3, .object = "7", .detail = "d"}}});
    return result;
}

TEST(FindingLists, EveryCodeIsInEveryForm) {
    const CheckedScenes all = AllFindings();
    const std::string lines = ToLines(all);
    EXPECT_EQ(static_cast<std::size_t>(std::ranges::count(lines, '\n')), CodeTable().size());
    for (const CodeInfo& info : CodeTable())
        EXPECT_NE(lines.find(" [" + std::string(info.name) + "]\n"), std::string::npos);
    EXPECT_EQ(json::parse(ToJson(all)).at("findings").size(), CodeTable().size());
    const json run = json::parse(ToSarif(all)).at("runs").at(0);
    EXPECT_EQ(run.at("results").size(), CodeTable().size());
    for (const json& found : run.at("results"))
        EXPECT_EQ(
            run.at("tool").at("driver").at("rules").at(found.at("ruleIndex").get<std::size_t>()).at("id"),
            found.at("ruleId"));
}

TEST(Baseline, AcceptsAllThatItWasMadeOfWhateverTheNames) {
    const program::WorkingDirectory folder;
    CheckedScenes all = AllFindings();
    folder.Write("baseline", ToJson(all));
    Baseline baseline((folder.Path() / "baseline").string());
    EXPECT_EQ(baseline.Left(), all.scenes.size());
    std::ranges::reverse(all.scenes);
    for (CheckedScene& scene : all.scenes) {
        scene.findings[0].line = 99;
        baseline.Accept(scene);
        EXPECT_TRUE(scene.findings.empty());
    }
    EXPECT_EQ(baseline.Accepted(), all.scenes.size());
    EXPECT_EQ(baseline.Left(), 0u);
}

TEST(Baseline, WhatIsNoneIsToldByItsName) {
    const program::WorkingDirectory folder;
    const std::string path = (folder.Path() / "baseline").string();
    EXPECT_TRUE(ErrorOf<Failure>([&] { Baseline b(path); }).starts_with("Cannot read the baseline " + path));
    for (const char* text :
         {"", "{}", "[]", "{\"findings\": [{}]}",
          "{\"findings\": [{\"code\": 1, \"file\": \"\", \"object\": \"\", \"detail\": \"\"}]}"}) {
        folder.Write("baseline", text);
        EXPECT_EQ(ErrorOf<Failure>([&] { Baseline b(path); }),
                  "The baseline " + path + " isn't what \"ovrin check --json\" writes")
            << text;
    }
}

TEST(AsUtf8, ValidTextStaysAndDifferentBytesDiffer) {
    EXPECT_EQ(AsUtf8("Träger\n\t"), "Träger\n\t");
    EXPECT_NE(AsUtf8("\xff"), AsUtf8("\xfe"));
    EXPECT_NO_THROW(json(AsUtf8("a\xe2\x86")).dump());
}

struct ScenesToCheckTest : GitFolder {
    static Names NamesOf(const std::vector<SceneToCheck>& scenes) {
        Names names;
        for (const SceneToCheck& scene : scenes)
            names.push_back(scene.name + (scene.take ? "=" + scene.take() : ""));
        return names;
    }
};

TEST_F(ScenesToCheckTest, StagedOnesHaveTheBytesOfTheNextCommit) {
    Commit({{"a.ovrin", "1"}, {"same.ovrin", "1"}, {"gone.ovrin", "1"}});
    folder.Write("a.ovrin", "2");
    folder.Write("new.prefab", "n");
    folder.Write("text.txt", "n");
    std::filesystem::remove("gone.ovrin");
    Git({"add", "-A"});
    folder.Write("a.ovrin", "3");
    EXPECT_EQ(NamesOf(StagedScenes(Found())), (Names{"a.ovrin=2", "new.prefab=n"}));
    EXPECT_EQ(NamesOf(ChangedScenes(Found())), (Names{"a.ovrin=3", "new.prefab=n"}));
    EXPECT_EQ(NamesOf(AllScenes(Found())), (Names{"a.ovrin=3", "new.prefab=n", "same.ovrin=1"}));
}

TEST_F(ScenesToCheckTest, UnmergedOneHasNoBytesInTheIndex) {
    const std::string base = Commit({{"a.ovrin", "1"}});
    CommitOn("topic", base, {{"a.ovrin", "2"}});
    Git({"checkout", "-q", "main"});
    Commit({{"a.ovrin", "3"}});
    EXPECT_EQ(RunProcess({"git", "merge", "topic"}).status, 1);
    EXPECT_EQ(NamesOf(StagedScenes(Found())), Names{"a.ovrin"});
}

TEST_F(ScenesToCheckTest, LinksAreNoScenesAndDescriptionsMayBeOther) {
    std::filesystem::create_symlink("a.meta", "link.ovrin");
    Commit({{"a.meta", "m"}});
    const std::vector<SceneToCheck> scenes = AllScenes(Found());
    EXPECT_EQ(NamesOf(scenes), Names{"a.meta=m"});
    EXPECT_TRUE(scenes[0].mayBeOther);
    EXPECT_EQ(NamesOf(StagedScenes(Found())), Names{});
}

TEST_F(ScenesToCheckTest, NamedOnesAreReadWhateverTheirName) {
    folder.Write("text.txt", "t");
    const Repository repository = Found();
    const std::vector<SceneToCheck> scenes = NamedScenes({"./text.txt", "/dev/null", "none"}, &repository);
    EXPECT_EQ(scenes[0].path, "text.txt");
    EXPECT_EQ(scenes[0].take(), "t");
    EXPECT_EQ(scenes[1].path, "");
    EXPECT_EQ(ErrorOf<Failure>([&] { scenes[2].take(); }), "Cannot read it: No such file or directory");
    EXPECT_THROW(StagedScenes({SystemKind::Mercurial, "/", "/"}), Failure);
}

} // namespace
