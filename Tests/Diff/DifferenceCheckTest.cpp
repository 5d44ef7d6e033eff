#include "Diff/DifferenceCheck.h"
#include "Support/Diffs.h"

#include <map>
#include <random>

namespace {

using namespace diffs;

class Difference : public RulesTest {};

/// A value in flow style: few keys and texts, so that two have much in common; now and then a key twice.
std::string RandomValue(std::mt19937& random, int depth) {
    static const char* const kTexts[] = {"1", "1.01", "2", "x"};
    static const char* const kKeys[] = {"a", "b", "c"};
    if (depth == 0 || random() % 5 == 0) return kTexts[random() % 4];
    const bool isList = random() % 3 == 0;
    std::string text;
    for (const char* key : kKeys)
        if (random() % 3)
            text += (text.empty() ? "" : ", ") + (isList ? "" : key + std::string(": ")) +
                    RandomValue(random, depth - 1);
    if (!isList && random() % 20 == 0) text += (text.empty() ? "" : ", ") + std::string("a: 3, a: 4");
    return isList ? "[" + text + "]" : "{" + text + "}";
}

/// Asks check and diff about two containers and then, as a merge does, about those in them. Stops where the
/// merge would.
void AskLevelByLevel(DifferenceCheck& check, const YAMLNode* left, const YAMLNode* right,
                     std::map<std::string, int>& answers) {
    const auto *leftMap = AsMapping(left), *rightMap = AsMapping(right);
    const auto *leftList = AsSequence(left), *rightList = AsSequence(right);
    if (!(leftMap && rightMap) && !(leftList && rightList)) return;
    std::string asked, built;
    const auto word = [](bool differ) { return differ ? "differ" : "equal"; };
    const std::string error = ErrorOf(
        [&] { asked = word(leftMap ? check.Differ(leftMap, rightMap) : check.Differ(leftList, rightList)); });
    EXPECT_EQ(error, ErrorOf([&] {
                  built = word(
                      leftMap ? !YAMLMappingDiff::Diff(TheRules(), leftMap, rightMap)->Entries().empty()
                              : !YAMLSequenceDiff::Diff(TheRules(), leftList, rightList)->Entries().empty());
              }));
    EXPECT_EQ(asked, built);
    ++answers[error == "none" ? asked : "error"];
    if (asked != "differ") return;
    if (leftMap)
        for (const auto& [key, value] : *leftMap) AskLevelByLevel(check, value, rightMap->Get(key), answers);
    else
        for (std::size_t i = 0; i < std::min(leftList->m_Items.size(), rightList->m_Items.size()); ++i)
            AskLevelByLevel(check, leftList->m_Items[i], rightList->m_Items[i], answers);
}

TEST_F(Difference, IsWhatTheDiffSaysWhateverTheRules) {
    for (const char* rules : {"", "[comparisons]\nfloat a 0.1 0.1\nfloat a.b 0.1 0.1\nfloat *.*.c 0.1 0.1\n",
                              "[arrays]\nset a.a b\nplain b.b.b\nset * _\n[comparisons]\nfloat b.1 0.1 0.1\n",
                              "[exclusions]\nexcludeIfContains b a.a\nincludeIfContains *.b.c a\n"}) {
        Rules(rules);
        std::map<std::string, int> answers;
        for (unsigned seed = 0; seed < 5000; ++seed) {
            std::mt19937 random(seed);
            const auto value = [&] { return Node("{a: " + RandomValue(random, 5) + "}"); };
            DifferenceCheck check(TheRules());
            AskLevelByLevel(check, value(), value(), answers);
            ASSERT_FALSE(HasFailure()) << "seed " << seed << " rules " << rules;
        }
        EXPECT_GT(std::min({answers["differ"], answers["equal"], answers["error"]}), 20) << rules;
    }
}

} // namespace
