#include "Diff/RulesReader.h"
#include "Support/Diffs.h"
#include "Values/YAMLMapping.h"

#include <gtest/gtest.h>

#include <fstream>
#include <sstream>
#include <stdexcept>

namespace {

using namespace diffs;

class MergeRulesTest : public RulesTest {
protected:
    static std::string Failure(const std::string& text) {
        return ErrorOf<std::runtime_error>([&] { Rules(text); });
    }
};

Path P(const std::string& text) {
    return ToRulePath(text);
}

std::string Values(const std::vector<Path>& fieldPaths, const YAMLNode* node) {
    std::string text;
    for (const YAMLScalar* value : MergeRules::GetUniqueMappingValues(fieldPaths, node))
        text += std::string(value->Value()) + ";";
    return text;
}

std::vector<Path> Keys(const std::string& path) {
    return TheRules().SelectKeyPaths(P(path)).keys;
}

TEST_F(MergeRulesTest, TheFirstBadLineIsReported) {
    const std::pair<const char*, const char*> cases[] = {
        {"set a b", "Rules file must specify section before any rules e.g. [arrays]. at line 1"},
        {" # x", "Rules file must specify section before any rules e.g. [arrays]. at line 1"},
        {"[arrays]\r\n", "Rules file must specify section before any rules e.g. [arrays]. at line 1"},
        {"[arrays]\n\n   \n# x\nset", "Invalid rule format at line 5"},
        {"[arrays]\nsets a", "Invalid rule format missing action at line 2"},
        {"[arrays]\nset a\nset", "Invalid format of unique key specification at line 2"},
        {"[exclusions]\nexclude", "Invalid rule format at line 2"},
        {"[exclusions]\nexcluded a", "Invalid format of excluded key specification at line 2"},
        {"[exclusions]\nincludeIfContains a", "Invalid format of excludeIfContains specification at line 2"},
        {"[comparisons]\nfloat", "Invalid rule format at line 2"},
        {"[comparisons]\nfloat a.b 1 2 3", "Invalid rule format at line 2"},
        {"[comparisons]\ndouble a", "Invalid rule format missing action at line 2"},
        {"[premerge]\nlegacyBlankPremergeBase x", "Invalid rule format at line 2"},
        {"[premerge]\nblank", "Invalid rule format missing action at line 2"},
    };
    for (const auto& [text, error] : cases) EXPECT_EQ(Failure(text), error + std::string("\n")) << text;
    EXPECT_EQ(Failure("[arrays] extra\nplain a\tb"), "none");
}

TEST_F(MergeRulesTest, RulesAboveABadLineStay) {
    Failure("[exclusions]\nexclude a\nbad a\nexclude b");
    EXPECT_FALSE(TheRules().IsMergeablePath(P("a")));
    EXPECT_TRUE(TheRules().IsMergeablePath(P("b")));
}

TEST_F(MergeRulesTest, AStarIsExactlyOneElement) {
    EXPECT_TRUE(MergeRules::MatchesPath(P("*.a"), P("1.a")));
    for (const char* path : {"1.2.a", "a", "1.b", "1.a.2", ""})
        EXPECT_FALSE(MergeRules::MatchesPath(P("*.a"), P(path))) << path;
    EXPECT_TRUE(MergeRules::MatchesPath(P("..."), {}));
}

TEST_F(MergeRulesTest, TheFirstMatchingListRuleChoosesTheKeys) {
    Rules("[arrays]\nset *.T.m id owner.fileID\nplain *.T.p x\nset *.T.* name");
    EXPECT_EQ(Keys("1.T.m"), (std::vector<Path>{P("id"), P("owner.fileID")}));
    EXPECT_EQ(Keys("1.T.p"), std::vector<Path>{});
    EXPECT_EQ(Keys("1.T.q"), std::vector<Path>{P("name")});
    EXPECT_EQ(Keys("1.U.q"), std::vector<Path>{P("fileID")});
    EXPECT_EQ(Keys("_"), std::vector<Path>{P("_")});
}

TEST_F(MergeRulesTest, AKeyIsCompleteOrEmpty) {
    const YAMLMapping* node = Doc("a: 1\nb: {c: 2}");
    EXPECT_EQ(Values({P("a"), P("b.c"), P("*"), P("b.*"), P("_.b._.c")}, node), "1;2;1;2;2;");
    for (const char* missing : {"x", "a.x", "b", "b.x", "_"})
        EXPECT_EQ(Values({P("a"), P(missing)}, node), "") << missing;
    EXPECT_EQ(Values({P("_")}, YAMLScalar::one), "1;");
    EXPECT_EQ(Values({P("*")}, Doc("")), "");
    EXPECT_EQ(Values({P("_")}, nullptr), "");
}

TEST_F(MergeRulesTest, RepeatedKeysCannotBeLookedUp) {
    const YAMLMapping* node = Doc("a: 1\na: 2");
    for (const char* path : {"a", "*"})
        EXPECT_THROW(MergeRules::GetYAMLNodeFieldByPath(node, P(path)), YAMLError) << path;
}

TEST_F(MergeRulesTest, TheFirstMatchingExclusionDecides) {
    Rules("[exclusions]\ninclude x\nexclude x\n[premerge]\n[exclusions]\nexclude y\ninclude y");
    EXPECT_TRUE(TheRules().IsMergeablePath(P("x")));
    EXPECT_FALSE(TheRules().IsMergeablePath(P("y")));
    EXPECT_TRUE(TheRules().IsMergeablePath(P("z")));
}

TEST_F(MergeRulesTest, AConditionalExclusionNeedsAllItsFields) {
    Rules("[exclusions]\nexcludeIfContains x a b\nincludeIfContains x c\nexcludeIfContains x a\n");
    const auto mergeable = [](const YAMLNode* node) { return TheRules().IsMergeablePath(P("x"), node); };
    EXPECT_FALSE(mergeable(Doc("{a: 1, b: 1, c: 1}")));
    EXPECT_TRUE(mergeable(Doc("{a: 1, c: 1}")));
    EXPECT_FALSE(mergeable(Doc("a: 1")));
    EXPECT_TRUE(mergeable(Doc("")));
    EXPECT_TRUE(TheRules().IsMergeablePath(P("x"))) << "conditional rules need a value";
}

TEST_F(MergeRulesTest, TolerancesAreReadLikeStreamsReadNumbers) {
    Rules("[comparisons]\nfloat a\nfloat b 0.5\nfloat c 0.5 2x\nfloat d x\n");
    const std::tuple<const char*, float, float> expected[] = {
        {"a", 1.1920929e-07f, 1.1920929e-07f}, {"b", 0.5f, 0.5f}, {"c", 0.5f, 2.f}, {"d", 0.f, 0.f}};
    for (const auto& [path, relative, absolute] : expected) {
        EXPECT_EQ(TheRules().FindTolerance(P(path))->relative, relative) << path;
        EXPECT_EQ(TheRules().FindTolerance(P(path))->absolute, absolute) << path;
    }
}

TEST_F(MergeRulesTest, BlanksInThePremergedBaseAreAskedFor) {
    EXPECT_FALSE(TheRules().CheckBlankPremergeBaseEnabled());
    Rules("[premerge]\n legacyBlankPremergeBase ");
    EXPECT_TRUE(TheRules().CheckBlankPremergeBaseEnabled());
}

TEST_F(MergeRulesTest, TheFactoryRulesKeyComponentsAndOverridesAndHideNothing) {
    std::ifstream file(OVRIN_SOURCE_DIR "/Src/Data/mergerules.txt");
    ASSERT_TRUE(file);
    LoadSequenceUniqueKeys(file, TheRules());
    EXPECT_EQ(Values(Keys("1.GameObject.m_Component"), Doc("component: {fileID: 12}")), "12;");
    const YAMLMapping* change = Doc("target: {fileID: 7}\npropertyPath: m_Name\nvalue: x");
    for (const char* instance : {"1.PrefabInstance", "1.Prefab"})
        EXPECT_EQ(Values(Keys(instance + std::string(".m_Modification.m_Modifications")), change),
                  "7;m_Name;");
    EXPECT_TRUE(TheRules().Comparisons().empty());
}

} // namespace
