#include "Commands/ReviewVersions.h"

#include "ErrorOf.h"
#include "Support/GitFolder.h"
#include "Words/Failure.h"

#include <filesystem>

namespace {

using namespace ovrin;
using failures::ErrorOf;

std::string Scene(const std::string& words) {
    return "%YAML 1.1\n%TAG !o! tag:test,2011:\n--- !o!1 &10\nGameObject:\n  m_Name: " + words + "\n";
}

/// A line for each file, "path base|ours|theirs" with the names in the scenes, or why they can't be read.
std::string Told(const ReviewSources& sources) {
    std::string told;
    for (const ReviewSource& source : sources.files) {
        told += source.path + " ";
        const auto nameIn = [](const std::string& text) {
            return text.empty()                                 ? "-"
                   : text.find("m_Name: ") == std::string::npos ? "none"
                                                                : text.substr(text.find("m_Name: ") + 8);
        };
        try {
            const std::optional<ThreeTexts> texts = source.read();
            told += texts ? nameIn(texts->base) + "|" + nameIn(texts->ours) + "|" + nameIn(texts->theirs)
                          : "no scene";
        } catch (const Failure& failure) {
            told += failure.what();
        }
        std::erase(told, '\n');
        told += ";";
    }
    return told;
}

struct ReviewVersionsTest : GitFolder {
    /// Merges branch "topic" of these files into "main", as if the merge took all of ours.
    void Merge(const std::map<std::string, std::string>& base, const std::map<std::string, std::string>& ours,
               const std::map<std::string, std::string>& theirs) const {
        const std::string start = Commit(base);
        CommitOn("topic", start, theirs);
        Git({"checkout", "-q", "main"});
        Commit(ours);
        Git({"merge", "-q", "-s", "ours", "-m", "merged", "topic"});
    }
};

TEST_F(ReviewVersionsTest, AheadOfTheFirstCommitThereIsWhatIsStaged) {
    folder.Write("a.ovrin", Scene("A"));
    Git({"add", "-A"});
    EXPECT_EQ(Told(VersionsToReview({{}, {}, true, ""})), "a.ovrin none|none|A;");
    EXPECT_EQ(ErrorOf<Failure>([] { VersionsToReview({}); }),
              "There is no commit here yet to compare with: --staged takes what is to become the first one");
}

TEST_F(ReviewVersionsTest, OfTheTreeAreThoseOfTheLastCommitAndTheDisk) {
    Commit({{"a.ovrin", Scene("A")}, {"b.ovrin", Scene("B")}, {"words", "1\n"}});
    folder.Write("a.ovrin", Scene("A2"));
    Git({"add", "-A"});
    folder.Write("a.ovrin", Scene("A3"));
    folder.Write("words", "2\n");
    std::filesystem::remove("b.ovrin");
    EXPECT_EQ(Told(VersionsToReview({})), "a.ovrin A|A|A3;b.ovrin B|B|none;words no scene;");
    EXPECT_EQ(Told(VersionsToReview({{}, {}, true, ""})), "a.ovrin A|A|A2;");
}

TEST_F(ReviewVersionsTest, OfAMergeAreThoseOfItsSidesWhateverWasCommitted) {
    const std::string odd = "odd \xff.ovrin";
    Merge({{"a.ovrin", Scene("1")}, {odd, Scene("1")}, {"words", "1\n"}, {"sub/c.ovrin", Scene("1")}},
          {{"a.ovrin", Scene("2")},
           {odd, Scene("2")},
           {"words", "2\n"},
           {"sub/c.ovrin", Scene("2")},
           {"d.ovrin", Scene("2")}},
          {{"a.ovrin", Scene("3")},
           {odd, "\n"},
           {"words", "3\n"},
           {"sub/c.ovrin", Scene("3")},
           {"d.ovrin", Scene("3")}});
    EXPECT_EQ(Told(SidesOfMerge("HEAD", {})),
              "a.ovrin 1|2|3;d.ovrin -|2|3;" + odd +
                  " odd \\xff.ovrin of theirs is no scene: it doesn't begin with %YAML; let the editor save "
                  "it again, or name another file;sub/c.ovrin 1|2|3;words no scene;");
    const surroundings::Here sub("sub");
    EXPECT_EQ(Told(SidesOfMerge("HEAD", {"../d.ovrin", "c.ovrin"})), "d.ovrin -|2|3;sub/c.ovrin 1|2|3;");
    EXPECT_EQ(ErrorOf<Failure>([] { SidesOfMerge("HEAD^1", {}); }),
              "HEAD^1 is no merge of two sides: \"ovrin review HEAD^1^ HEAD^1\" shows what it changed");
    EXPECT_EQ(ErrorOf<Failure>([] { SidesOfMerge("HEAD", {"none"}); }),
              "Both sides of the merge changed nothing at none");
}

} // namespace
