#include "Systems/Caller.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;
using Words = std::vector<std::string>;

/// "program command: words" of a caller; "" for none.
std::string Told(const Words& words) {
    const auto caller = CallerOf(words);
    if (!caller) return {};
    std::string told = caller->program + " " + caller->command + ":";
    for (const std::string& word : caller->words) told += " " + word;
    return told;
}

TEST(Caller, IsToldFromOtherPrograms) {
    const auto picked = CallerOf({"/usr/bin/git", "-C", "merge", "--no-pager", "cherry-pick", "-x", "topic"});
    ASSERT_TRUE(picked);
    EXPECT_EQ(picked->command, "cherry-pick");
    EXPECT_EQ(picked->Operands(), Words{"topic"});
    EXPECT_EQ(CallerOf({"/usr/lib/git-core/git-stash", "pop"})->command, "stash");
    EXPECT_EQ(CallerOf({"/usr/bin/python3", "/usr/bin/hg", "--config", "a.b=c", "merge"})->command, "merge");
    EXPECT_FALSE(CallerOf({"/bin/sh", "-c", "git merge"}));
    EXPECT_FALSE(CallerOf({}));
}

TEST(Caller, CommandStandsBehindTheOptionsOfItsSystem) {
    const struct {
        Words words;
        const char* told;
    } cases[] = {
        {{"git"}, "git :"},
        {{"git", "--version"}, "git :"},
        {{"git", "-C"}, "git :"},
        {{"git", "merge"}, "git merge:"},
        {{"git", "-c", "merge.tool=x", "-C", "rebase", "--git-dir", "am", "revert", "HEAD"},
         "git revert: HEAD"},
        {{"git", "--git-dir=x", "--bare", "merge", "--no-ff", "a"}, "git merge: --no-ff a"},
        {{"/opt/git/bin/git-merge-recursive", "a", "--", "b", "c"}, "git merge-recursive: a -- b c"},
        {{"hg", "-R", "merge", "--cwd", "x", "graft", "-r", "1"}, "hg graft: -r 1"},
        {{"svn", "--username", "update", "--config-dir", "x", "merge", "^/trunk"}, "svn merge: ^/trunk"},
        {{"/usr/bin/python3.11", "/usr/bin/hg", "up"}, "hg up:"},
        {{"python"}, ""},
        {{"python3", "script.py", "hg"}, ""},
        {{"gitk", "merge"}, ""},
        {{"hgview"}, ""},
        {{"svnserve", "-d"}, ""},
        {{"", "merge"}, ""},
    };
    for (const auto& [words, told] : cases) EXPECT_EQ(Told(words), told) << testing::PrintToString(words);
}

TEST(Caller, OperandsAreNoOptions) {
    const Caller caller{"git", "merge", {"--no-ff", "a", "-m", "b", ""}};
    EXPECT_EQ(caller.Operands(), (Words{"a", "b", ""}));
}

} // namespace
