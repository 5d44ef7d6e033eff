#include "Conflicts/Conflict.h"

#include "Conflicts/ConflictReport.h"
#include "Conflicts/DecisionPath.h"

#include <gtest/gtest.h>
#include <nlohmann/json.hpp>

namespace {

using namespace ovrin;

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string Lantern(const std::string& layer, const std::string& more = "") {
    return "--- !o!1 &10\nGameObject:\n  m_Layer: " + layer + "\n  m_Name: Lantern\n" + more;
}

std::string Light(const std::string& brightness) {
    return "--- !o!108 &20\nLight:\n  m_GameObject: {fileID: 10}\n  m_Brightness: " + brightness + "\n";
}

struct ConflictTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }

    ConflictTest() { merge.Merge(); }

    SceneMerge merge{{kHeader + Lantern("1") + Light("{r: 1}"), kHeader + Lantern("5") + Light("{r: 3}"),
                      kHeader + Lantern("2")},
                     {}};
};

TEST_F(ConflictTest, ReportNamesObjectsAndTellsAllThreeValues) {
    EXPECT_EQ(TellConflicts(merge, {"", "main", "topic"}), "Lantern (10)\n"
                                                           "  m_Layer: both changed it\n"
                                                           "    base    1\n"
                                                           "    ours    5    main\n"
                                                           "    theirs  2    topic\n"
                                                           "Lantern · Light (20)\n"
                                                           "  theirs removed it and ours changed it\n"
                                                           "    base    there\n"
                                                           "    ours    changed m_Brightness    main\n"
                                                           "    theirs  removed                 topic\n");
    EXPECT_TRUE(TellConflicts(merge, {}, 1).ends_with("    theirs  2\nand 1 more\n"));
}

TEST_F(ConflictTest, ScriptsGetPathsThatDecisionsName) {
    const nlohmann::json json = ConflictsToJson(merge);
    EXPECT_EQ(json.at("open"), 2);
    const nlohmann::json& light = json.at("conflicts").at(1);
    EXPECT_EQ(light.at("kind"), "theirs-removed");
    EXPECT_EQ(light.at("theirs"), nullptr);
    EXPECT_EQ(light.at("base").at("value").at("Light").at("m_Brightness").at("r"), "1");
    merge.Merge(std::vector<Decision>{{light.at("path"), Side::Ours}});
    EXPECT_EQ(merge.Open().size(), 1u);
}

TEST_F(ConflictTest, PathsOfDecisionsKeepDotsWithinKeys) {
    const ovrin_yaml::Path path = {ovrin_yaml::YAMLScalar::Lookup("10"),
                                   ovrin_yaml::YAMLScalar::Lookup("a.b\\c"),
                                   ovrin_yaml::YAMLScalar::Lookup("")};
    EXPECT_EQ(DecisionPath(path), "10.a\\.b\\\\c.");
    EXPECT_EQ(PathOfDecision(DecisionPath(path)), path);
}

} // namespace
