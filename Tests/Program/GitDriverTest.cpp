// The program as git's merge driver: %O is the base, %A our file and the result's place, %B the other
// branch's.

#include "Support/Program.h"

#include <gtest/gtest.h>

namespace {

using namespace program;

const std::string kHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

std::string GameObject(const std::string& name, const std::string& components) {
    return kHeader + "--- !o!1 &10\nGameObject:\n  m_Component:\n" + components + "  m_Name: " + name +
           "\n  m_Layer: 0\n";
}

std::string Component(int id) {
    return "  - component: {fileID: " + std::to_string(id) + "}\n";
}

/// A repository that uses the driver, with a scene that has been committed on a branch "main".
class GitDriver : public testing::Test {
protected:
    void SetUp() override {
        if (repository.Run("git --version") != 0) GTEST_SKIP() << "git is not installed";
        repository.Write("setup",
                         "git init -q .\ngit config user.name T\ngit config user.email t@example.com\n"
                         "git config commit.gpgsign false\ngit config merge.ovrin.name structural\n"
                         "git config merge.ovrin.driver "
                         "\"'$OVRIN' merge --force --fallback none %O %B %A %A\"\n"
                         "echo '*.ovrin merge=ovrin' > .gitattributes\n"
                         "printf 'std*\\nsetup\\n' > .gitignore\n");
        ASSERT_EQ(Git("sh -e ./setup"), 0) << repository.Read("stderr");
        Commit(GameObject("base", Component(1) + Component(2)));
        ASSERT_EQ(Git("git branch -M main && git checkout -qb theirs"), 0) << repository.Read("stderr");
    }

    /// Nothing of the machine's or the user's own settings takes part.
    int Git(const std::string& command) const {
        return repository.Run(
            "export HOME=$PWD GIT_CONFIG_NOSYSTEM=1 GIT_CONFIG_GLOBAL=/dev/null; unset GIT_DIR; " + command);
    }

    void Commit(const std::string& scene) const {
        repository.Write("scene.ovrin", scene);
        ASSERT_EQ(Git("git add -A && git commit -qm change"), 0) << repository.Read("stderr");
    }

    /// Commits each side's scene on its branch and merges theirs into ours; git's exit status.
    int MergeBranches(const std::string& theirs, const std::string& ours) const {
        Commit(theirs);
        Git("git checkout -q main");
        Commit(ours);
        return Git("git merge -q -m merged theirs");
    }

    const WorkingDirectory repository;
};

const std::string kTheirs = GameObject("base", Component(1) + Component(3) + Component(2));
const std::string kOurs = GameObject("ours", Component(1) + Component(4) + Component(2));

TEST_F(GitDriver, AMergeThatALineMergeTearsComesOutClean) {
    EXPECT_EQ(MergeBranches(kTheirs, kOurs), 0) << repository.Read("stdout") << repository.Read("stderr");
    EXPECT_EQ(repository.Read("scene.ovrin"),
              GameObject("ours", Component(1) + Component(3) + Component(4) + Component(2)));
    EXPECT_EQ(Git("test -z \"$(git status --porcelain)\""), 0) << "all is committed";
}

TEST_F(GitDriver, WithoutTheDriverTheSameMergeIsTorn) {
    ASSERT_EQ(Git("rm .gitattributes && git commit -qam plain && git branch -f main"), 0);
    EXPECT_NE(MergeBranches(kTheirs, kOurs), 0);
}

TEST_F(GitDriver, ATrueConflictLeavesThePathUnmerged) {
    EXPECT_NE(
        MergeBranches(GameObject("theirs", Component(1)), GameObject("ours", Component(1) + Component(2))),
        0);
    EXPECT_NE(repository.Read("stdout").find("Left  10.GameObject.m_Name change to theirs"),
              std::string::npos)
        << "the other branch is left: " << repository.Read("stdout");
    EXPECT_EQ(repository.Read("scene.ovrin"), GameObject("base", Component(1))) << "all else is merged";
    Git("git status --porcelain");
    EXPECT_EQ(repository.Read("stdout"), "UU scene.ovrin\n");
}

} // namespace
