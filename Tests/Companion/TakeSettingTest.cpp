#include "Conflicts/TakeSetting.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

namespace {

using namespace ovrin;
using failures::ErrorOf;
using surroundings::Variable;

struct TakeSettingTest : GitFolder {
    Side Taken() const { return SideToTake(Found()); }

    const Variable none{"OVRIN_TAKE", {}};
};

TEST_F(TakeSettingTest, OursIsTakenWhereNothingIsSet) {
    EXPECT_EQ(Taken(), Side::Ours);
    EXPECT_EQ(SideToTake(std::nullopt), Side::Ours);
    EXPECT_EQ(SideToTake(Repository{SystemKind::Subversion, "/", "/"}), Side::Ours);
}

TEST_F(TakeSettingTest, EnvironmentWinsOverTheConfiguration) {
    Git({"config", "ovrin.take", "base"});
    EXPECT_EQ(Taken(), Side::Base);
    const Variable theirs("OVRIN_TAKE", "theirs");
    EXPECT_EQ(Taken(), Side::Theirs);
    EXPECT_EQ(SideToTake(std::nullopt), Side::Theirs);
    const Variable empty("OVRIN_TAKE", "");
    EXPECT_EQ(Taken(), Side::Base);
}

TEST_F(TakeSettingTest, WhatIsNoSideIsToldWithItsPlace) {
    Git({"config", "ovrin.take", "Theirs"});
    EXPECT_EQ(
        ErrorOf<Failure>([&] { Taken(); }),
        "There is no side \"Theirs\": it is base, ours or theirs (it stands in the setting ovrin.take)");
    const Variable wrong("OVRIN_TAKE", "left");
    EXPECT_TRUE(ErrorOf<Failure>([&] { Taken(); }).ends_with("(it stands in OVRIN_TAKE)"));
}

TEST_F(TakeSettingTest, ConfigurationThatCantBeReadIsNotTakenForNone) {
    folder.Write(".git/config", "[core\n");
    const std::string failure = ErrorOf<Failure>([&] {
        SideToTake(Repository{SystemKind::Git, folder.Path(), ".git"});
    });
    EXPECT_TRUE(failure.starts_with("Cannot read the setting ovrin.take: git says:\n")) << failure;
}

TEST_F(TakeSettingTest, MercurialIsAskedWithoutWhatUsersLikeToSee) {
    surroundings::FakePrograms programs;
    const Repository repository = {SystemKind::Mercurial, "/", "/"};
    programs.Say("hg", "ovrin.take", "theirs\n");
    EXPECT_EQ(SideToTake(repository), Side::Theirs);
    programs.Say("hg", "ovrin.take", "", 1);
    EXPECT_EQ(SideToTake(repository), Side::Ours);
    programs.Say("hg", "ovrin.take", "", 255);
    EXPECT_THROW(SideToTake(repository), Failure);
}

} // namespace
