#include "Repair/PreProcess.h"

#include "Support/ObjectText.h"

#include <gtest/gtest.h>

using namespace object_text;

namespace {

std::string Transitions(const std::string& text) {
    return "1107 &1 AnimatorStateMachine: {m_StateMachineTransitions: " + text + "}\n";
}

TEST(PreProcess, TurnsTransitionsIntoListsAndBack) {
    const std::pair<const char*, const char*> kCases[] = {
        {"{a: 1, a: {b: 2}}", "{a: 1}, {a: {b: 2}}"},
        {"{a: [1, 2]}", "{a: [1, 2]}"},
        {"{}", ""},
    };
    for (const auto& [stored, items] : kCases) {
        Scene scene(Transitions(stored));
        const std::string before = scene.Text();
        PreProcess(scene.Root());
        EXPECT_EQ(scene.Text(), Scene(Transitions("[" + std::string(items) + "]")).Text());
        RestoreRepeatedKeys(scene.Root());
        EXPECT_EQ(scene.Text(), before);
    }
}

TEST(PreProcess, LeavesOtherObjectsAloneWithTheirHashes) {
    Scene scene("114 &1 MonoBehaviour: {m_StateMachineTransitions: {a: 1, a: 2}}\n"
                "1107 &2 AnimatorStateMachine: {m: {m_StateMachineTransitions: {a: 1}}}\n"
                "1107 &3 AnimatorStateMachine: x\n");
    const std::string before = scene.Text();
    const std::uint32_t hash = scene.Object("2").m_Hash;
    PreProcess(scene.Root());
    EXPECT_EQ(scene.Text(), before);
    EXPECT_EQ(scene.Object("2").m_Hash, hash);
    RestoreRepeatedKeys(scene.Root());
    EXPECT_EQ(scene.Text(), before);
}

TEST(PreProcess, HashOfAConvertedObjectCoversItsHeader) {
    const std::string body = " AnimatorStateMachine: {m_StateMachineTransitions: {}}";
    Scene scene("1107 &1" + body + "\n" + "1108 &2" + body);
    EXPECT_EQ(scene.Object("1").m_Hash, scene.Object("2").m_Hash);
    PreProcess(scene.Root());
    EXPECT_NE(scene.Object("1").m_Hash, scene.Object("2").m_Hash);
}

TEST(PreProcess, FailsWhereTransitionsHaveAnotherShape) {
    for (const char* shape : {"[]", "x"}) {
        Scene scene(Transitions(shape));
        EXPECT_EQ(ErrorOf([&] { PreProcess(scene.Root()); }),
                  "Expected key to point to yaml mapping: m_StateMachineTransitions");
    }
    const std::pair<const char*, const char*> kRestored[] = {
        {"{}", "Expected key to point to yaml sequence: m_StateMachineTransitions"},
        {"[{a: 1, b: 2}]", "Expected size of one for key: m_StateMachineTransitions"},
        {"[x]", "Expected size of one for key: m_StateMachineTransitions"},
    };
    for (const auto& [shape, fault] : kRestored) {
        Scene scene(Transitions(shape));
        EXPECT_EQ(ErrorOf([&] { RestoreRepeatedKeys(scene.Root()); }), fault);
    }
}

TEST(PreProcess, FailsWhereAStateMachineOrAnObjectRepeatsAKey) {
    for (const char* object : {"1107 &1 AnimatorStateMachine: {a: 1, a: 2}", "1 &1 {a: 1, a: 2}"}) {
        Scene scene(object);
        EXPECT_EQ(ErrorOf([&] { PreProcess(scene.Root()); }),
                  "Cannot perform this operation on a YAML file with duplicate keys");
    }
}

} // namespace
