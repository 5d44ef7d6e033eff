#include "Settle/EarlierDecisions.h"

#include "Support/Surroundings.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include "Values/YAMLScalar.h"

#include <csignal>
#include <filesystem>
#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

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

    EarlierDecisions Kept() const {
        EarlierDecisions decisions({SystemKind::Git, "", data});
        decisions.Read();
        return decisions;
    }

    /// Two decisions, and the bytes of their file.
    std::string TwoKept() const {
        EarlierDecisions decisions = Kept();
        decisions.Add(Conflict("1", "2", "3"), Side::Theirs);
        decisions.Add(Conflict("4", "5", "6"), Side::Ours);
        decisions.Keep();
        return folder.Read("ovrin/decisions");
    }

    const program::WorkingDirectory folder;
    const std::string data = folder.Path();
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
    const std::string key(32, 'a');
    for (const std::string& text :
         {std::string(), std::string("ovrin decisions 2 ") + key, std::string("\0\n", 2),
          "ovrin decisions 1 " + key + "\nours\n", "ovrin decisions 1 " + key + "\n\n",
          "ovrin decisions 1 " + key + "\n" + key + " mine\n"}) {
        folder.Write("ovrin/decisions", text);
        EarlierDecisions decisions({SystemKind::Git, "", data});
        EXPECT_THROW(decisions.Read(), Failure) << text;
        EXPECT_TRUE(decisions.IsEmpty());
        decisions.Keep();
        EXPECT_NO_THROW(Kept());
    }
}

TEST_F(EarlierDecisionsTest, DamageNeverBringsAnotherSide) {
    const std::string whole = TwoKept();
    const auto expectNoOther = [&](const std::string& text) {
        folder.Write("ovrin/decisions", text);
        EarlierDecisions decisions({SystemKind::Git, "", data});
        try {
            decisions.Read();
        } catch (const Failure&) {
            EXPECT_TRUE(decisions.IsEmpty()) << text;
        }
        EXPECT_EQ(decisions.Find(Conflict("1", "2", "3")).value_or(Side::Theirs), Side::Theirs) << text;
        EXPECT_EQ(decisions.Find(Conflict("4", "5", "6")).value_or(Side::Ours), Side::Ours) << text;
    };
    for (std::size_t length = 0; length < whole.size(); ++length) {
        expectNoOther(whole.substr(0, length));
        for (const char damage : {'\0', '\n', ' ', '0', 'f', '\xff'}) {
            std::string damaged = whole;
            damaged[length] = damage;
            expectNoOther(damaged);
        }
    }
}

TEST_F(EarlierDecisionsTest, FullDiskLeavesTheFileAsItWas) {
    const std::string before = TwoKept();
    EarlierDecisions decisions = Kept();
    decisions.Add(Conflict("7", "8", "9"), Side::Base);
    for (const std::size_t bytes : {std::size_t{0}, std::size_t{40}, before.size()}) {
        const surroundings::FileLimit full(bytes);
        EXPECT_THROW(decisions.Keep(), Failure) << bytes;
        EXPECT_EQ(folder.Read("ovrin/decisions"), before) << bytes;
    }
    EXPECT_EQ(std::distance(std::filesystem::directory_iterator(data + "/ovrin"), {}), 1);
    decisions.Keep();
    EXPECT_EQ(Kept().Find(Conflict("7", "8", "9")), Side::Base);
}

TEST_F(EarlierDecisionsTest, PlaceWhereNothingCanStandIsTold) {
    folder.Write("ovrin", "a file");
    EXPECT_THROW(Kept(), Failure);
    EXPECT_THROW(EarlierDecisions({SystemKind::Git, "", data}).Keep(), Failure);
    std::filesystem::remove(data + "/ovrin");
    std::filesystem::create_directories(data + "/ovrin/decisions");
    EXPECT_THROW(Kept(), Failure);
    EXPECT_THROW(EarlierDecisions({SystemKind::Git, "", data}).Keep(), Failure);
}

TEST_F(EarlierDecisionsTest, ReaderMeetsWholeFilesWhileOthersWrite) {
    TwoKept();
    std::vector<pid_t> writers;
    for (const char* own : {"11", "12"}) {
        const pid_t writer = fork();
        if (writer == 0) {
            for (;;) {
                EarlierDecisions decisions = Kept();
                decisions.Add(Conflict(own, "8", "9"), Side::Base);
                decisions.Keep();
            }
        }
        writers.push_back(writer);
    }
    for (int i = 0; i < 2000; ++i) ASSERT_EQ(Kept().Find(Conflict("1", "2", "3")), Side::Theirs);
    for (const pid_t writer : writers) {
        kill(writer, SIGKILL);
        waitpid(writer, nullptr, 0);
    }
    EXPECT_EQ(Kept().Find(Conflict("4", "5", "6")), Side::Ours);
}

TEST_F(EarlierDecisionsTest, ValuesThatLookAlikeAreToldApart) {
    EarlierDecisions decisions = Kept();
    decisions.Add(Conflict("1", "23", "4"), Side::Ours);
    for (const auto& other : {Conflict("12", "3", "4"), Conflict("1", "2", "34"), Conflict("1", "4", nullptr),
                              Conflict("", "123", "4"), Conflict("1s", "23", "4")})
        EXPECT_FALSE(decisions.Find(other));
    decisions.Add(Conflict("1", "5", "5"), Side::Theirs); // both sides alike
    EXPECT_EQ(decisions.Find(Conflict("1", "5", "5")), Side::Theirs);
}

} // namespace
