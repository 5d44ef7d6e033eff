#include "Names/RecordPlace.h"

#include "SceneGenerator.h"

#include <gtest/gtest.h>

#include <sstream>

namespace {

using namespace ovrin;
using namespace ovrin_yaml;

/// A merge of three bodies of one MonoBehaviour, or of three whole files.
class Merged {
public:
    Merged(const std::string& base, const std::string& theirs, const std::string& ours) {
        initialize();
        MergeRules rules;
        rules.AddSequenceUniqueKeys(SequenceType::Set, {Id("*"), Id("MonoBehaviour"), Id("l")}, {{Id("n")}});
        session.SetRules(rules);
        session.Read({TextInput("base", File(base)), TextInput("theirs", File(theirs)),
                      TextInput("ours", File(ours))});
        session.Prepare();
        session.Diff();
        session.Merge();
    }

    /// "place: base, theirs, ours" of each open conflict.
    std::string Conflicts() {
        const MergeNames names(session);
        const RecordPlaces places(session, names);
        std::string text;
        for (const auto* record : session.PendingConflicts()) {
            const RecordPlace place = places.Find(*record);
            text += place.property + ":";
            for (const Version version : {Version::Base, Version::Theirs, Version::Ours}) {
                const YAMLScalar* value = AsScalar(place.In(version));
                text += " " + (value ? std::string(value->Value()) : place.In(version) ? "..." : "-");
            }
            text += "\n";
        }
        return text;
    }

    static const YAMLScalar* Id(std::string_view text) { return YAMLScalar::Lookup(text); }
    static std::string File(const std::string& text) {
        if (text.starts_with('%')) return text;
        return "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n--- !o!114 &1\nMonoBehaviour: " + text + "\n";
    }

    MergeSession session{Threads::None};
};

TEST(RecordPlaces, TellsKeysAndValuesOfAllVersions) {
    EXPECT_EQ(Merged("\n  a: {b: 1}", "\n  a: {b: 2}", "\n  a: {b: 3}").Conflicts(), "a: ... ... ...\n");
    EXPECT_EQ(Merged("\n  a:\n    b: 1", "\n  a:\n    b: 2", "\n  a:\n    b: 3").Conflicts(), "a.b: 1 2 3\n");
}

TEST(RecordPlaces, FindsElementsThatMovedOnBothSides) {
    EXPECT_EQ(Merged("\n  l:\n  - n: a\n    v: 1\n  - n: b\n    v: 1", //
                     "\n  l:\n  - n: x\n    v: 0\n  - n: a\n    v: 1\n  - n: b\n    v: 2",
                     "\n  l:\n  - n: y\n    v: 0\n  - n: b\n    v: 3")
                  .Conflicts(),
              "l[b].v: 1 2 3\n");
}

TEST(RecordPlaces, FindsElementsThatBothSidesAdded) {
    EXPECT_EQ(Merged("\n  l:\n  - n: a\n    v: 1", //
                     "\n  l:\n  - n: x\n    v: 0\n  - n: a\n    v: 1\n  - n: c\n    v: 2",
                     "\n  l:\n  - n: c\n    v: 3\n  - n: a\n    v: 1")
                  .Conflicts(),
              "l[c].v: - 2 3\n");
}

TEST(RecordPlaces, ValuesAreThoseThatTheSidesBring) {
    for (std::uint64_t seed = 1; seed <= 8; ++seed) {
        std::ostringstream base, left, right;
        const bool isList = seed % 2;
        ovrin_bench::SceneOptions options{.seed = seed, .objects = 300, .edited = 300000, .conflicts = 40};
        if (isList)
            options = {.mode = ovrin_bench::SceneOptions::Mode::BigList,
                       .seed = seed,
                       .edited = 300000,
                       .listLength = 200,
                       .keyedList = seed % 4 == 1};
        ovrin_bench::GenerateScene(options, {base, left, right});
        Merged merged(base.str(), left.str(), right.str());
        const MergeNames names(merged.session);
        const RecordPlaces places(merged.session, names);
        std::size_t checked = 0;
        for (const auto& record : merged.session.Resolver().Records()) {
            if (record.path.Elements()[0] == YAMLScalar::underscore) continue;
            const RecordPlace place = places.Find(record);
            for (const auto& [operation, version] :
                 {std::pair(record.left, Version::Theirs), std::pair(record.right, Version::Ours)}) {
                const bool isValued = As<AddOperation>(operation) || As<ChangeOperation>(operation);
                if (!isValued) continue;
                const auto* valued = static_cast<const ValuedOperation*>(operation);
                EXPECT_EQ(place.In(version), valued->m_Value) << seed << " " << PathToString(record.path);
                ++checked;
            }
        }
        EXPECT_GT(checked, 20u) << seed;
    }
}

} // namespace
