#include "ErrorOf.h"

#include "Session/MergeSession.h"
#include "Support/Diffs.h"

#include "Writing/ObjectFileWriter.h"

#include <sstream>
#include <utility>

namespace {

using namespace diffs;

std::string Written(const OvrinObjects& objects) {
    std::ostringstream stream;
    Output(objects, stream);
    return stream.str();
}

/// A session over three texts, ready to be merged.
struct Session : MergeSession {
    Session(const std::string& base, const std::string& left, const std::string& right) {
        initialize();
        Read({TextInput("base.ovrin", base), TextInput("left.ovrin", left), TextInput("right.ovrin", right)});
        Prepare();
        MergeSession::Diff();
    }

    /// The result of these decisions, with the paths of what is open in front.
    std::string Result(const std::vector<RecordResolve>& decisions) {
        Decide(decisions);
        Merge();
        Apply();
        Repair();
        std::string text;
        for (const Record* conflict : PendingConflicts()) text += PathToString(conflict->path) + "\n";
        return text + Written(MergeSession::Result());
    }
};

std::string Values(int a, int b) {
    return ObjectText("--- !o!1 &7\nThing:\n  a: " + std::to_string(a) + "\n  b: " + std::to_string(b) +
                      "\n");
}

TEST(MergeSession, EachMergeGoesByItsOwnDecisionsAlone) {
    Session session(Values(0, 0), Values(1, 1), Values(2, 2));
    const std::string open = "7.Thing.a\n7.Thing.b\n" + Values(0, 0);
    EXPECT_EQ(session.Result({}), open);
    EXPECT_EQ(session.Result({{PathOf("7.Thing.a"), ResolveLeft}}), "7.Thing.b\n" + Values(1, 0));
    EXPECT_EQ(session.Result({{PathOf("7.Thing.*"), ResolveRight}}), Values(2, 2));
    EXPECT_EQ(session.Result({}), open);
    EXPECT_EQ(Written(*session.Premerge(ResolveRight)), Values(2, 2));
    EXPECT_EQ(Written(session.BaseObjects()), Values(0, 0));
}

/// "file, object, line: reason"
std::string PlaceOfFailure(const std::string& base, const std::string& left, const std::string& right) {
    try {
        Session session(base, left, right);
    } catch (const MergeError& error) {
        return error.file + ", " + error.Object() + ", " + std::to_string(error.Line()) + ": " + error.reason;
    }
    return "none";
}

TEST(MergeSession, FailuresTellTheirPlace) {
    const std::string good = Values(0, 0), list = good + "--- !o!1 &8\n- 1\n",
                      broken = good + "--- !o!1 &8\nThing: {\n--- !o!1 &9\nThing: {}\n";
    EXPECT_EQ(PlaceOfFailure(good, list, good), "left.ovrin, 8, 7: Document root is not a mapping");
    EXPECT_EQ(PlaceOfFailure(good, good, broken), "right.ovrin, 8, 7: did not find expected node content");
    EXPECT_EQ(PlaceOfFailure(good, good, "nothing").substr(0, 15), "right.ovrin, , ");
    const std::string machine =
        ObjectText("--- !o!1 &5\nAnimatorStateMachine:\n  m_StateMachineTransitions: 1\n");
    EXPECT_EQ(PlaceOfFailure(machine, good, good),
              "base.ovrin, 5, 0: Expected key to point to yaml mapping: m_StateMachineTransitions");
}

/// It has no text then, while the base is read to its end.
TEST(MergeSession, AFailureInTheMiddleOfASideIsTold) {
    initialize();
    const std::string text = Values(0, 0) + "--- !o!1 &8\nThing:\n  a: 1\n";
    for (const Threads threads : {Threads::None, Threads::Everywhere}) {
        InputFile left = TextInput("left.ovrin", text);
        left.open = [&text]() -> ByteSource {
            return [&text, isFirst = true](char* bytes, std::size_t size) mutable {
                if (!std::exchange(isFirst, false)) throw YAMLError("Cannot read file");
                return text.substr(0, Values(0, 0).size()).copy(bytes, size);
            };
        };
        MergeSession session(threads);
        const auto read = [&] {
            session.Read({TextInput("base.ovrin", text), left, TextInput("right.ovrin", text)});
        };
        EXPECT_EQ(failures::ErrorOf(read), "Error parsing file 'left.ovrin': Cannot read file");
    }
}

} // namespace
