#include "Settle/EarlierDecisions.h"

#include "Systems/Repository.h"
#include "Words/Failure.h"

#include "Values/YAMLScalar.h"

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <gtest/gtest.h>

namespace {

using namespace ovrin;

EarlierDecisions::Values Conflict(const char* base, const char* ours, const char* theirs,
                                  const std::string& path = "1.Light.m_Range") {
    const auto value = [](const char* text) -> const ovrin_yaml::YAMLNode* {
        return text ? ovrin_yaml::YAMLScalar::Lookup(text) : nullptr;
    };
    return {path, {value(base), value(ours), value(theirs)}};
}

struct EarlierDecisionsTest : testing::Test {
    static void SetUpTestSuite() { ovrin_yaml::initialize(); }
    EarlierDecisionsTest() {
        char folder[] = "/tmp/ovrin-test-XXXXXX";
        data = mkdtemp(folder);
    }
    ~EarlierDecisionsTest() override { std::filesystem::remove_all(data); }

    EarlierDecisions Kept() const {
        EarlierDecisions decisions({SystemKind::Git, "", data});
        decisions.Read();
        return decisions;
    }

    std::string data;
};

TEST_F(EarlierDecisionsTest, AreKnownAgainByPathAndAllThreeValues) {
    EarlierDecisions decisions = Kept();
    decisions.Add(Conflict("1", "2", "3"), Side::Theirs);
    decisions.Add(Conflict("1", nullptr, "3"), Side::Base);
    decisions.Keep();
    const EarlierDecisions kept = Kept();
    EXPECT_EQ(kept.Find(Conflict("1", "2", "3")), Side::Theirs);
    EXPECT_EQ(kept.Find(Conflict("1", nullptr, "3")), Side::Base);
    for (const auto& other : {Conflict("1", "2", "4"), Conflict("2", "2", "3"), Conflict("1", "23", ""),
                              Conflict("1", "", "3"), Conflict("1", "2", "3", "1.Light.m_Rang")})
        EXPECT_FALSE(kept.Find(other));
}

TEST_F(EarlierDecisionsTest, SidesThatChangedPlacesAreSwappedAndTheLastDecisionCounts) {
    EarlierDecisions decisions = Kept();
    decisions.Add(Conflict("1", "2", "3"), Side::Theirs);
    EXPECT_EQ(decisions.Find(Conflict("1", "3", "2")), Side::Ours);
    decisions.Add(Conflict("1", "3", "2"), Side::Theirs);
    EXPECT_EQ(decisions.Find(Conflict("1", "2", "3")), Side::Ours);
}

TEST_F(EarlierDecisionsTest, OldOnesGoWhereThereAreTooMany) {
    EarlierDecisions decisions = Kept();
    for (std::size_t i = 0; i <= EarlierDecisions::kMost; ++i)
        decisions.Add(Conflict("1", "2", "3", std::to_string(i)), Side::Ours);
    decisions.Keep();
    const EarlierDecisions kept = Kept();
    EXPECT_FALSE(kept.Find(Conflict("1", "2", "3", "0")));
    EXPECT_EQ(kept.Find(Conflict("1", "2", "3", "1")), Side::Ours);
}

TEST_F(EarlierDecisionsTest, FileThatCannotBeMadeOutIsToldAndReplaced) {
    std::filesystem::create_directory(data + "/ovrin");
    const std::string key(32, 'a');
    for (const std::string& text :
         {std::string(), std::string("ovrin decisions 2 ") + key, std::string("\0\n", 2),
          "ovrin decisions 1 " + key + "\nours\n", "ovrin decisions 1 " + key + "\n\n",
          "ovrin decisions 1 " + key + "\n" + key + " mine\n"}) {
        std::ofstream(data + "/ovrin/decisions") << text;
        EarlierDecisions decisions({SystemKind::Git, "", data});
        EXPECT_THROW(decisions.Read(), Failure) << text;
        EXPECT_TRUE(decisions.IsEmpty());
        decisions.Keep();
        EXPECT_NO_THROW(Kept());
    }
}

} // namespace
