#include "Names/ValueText.h"

#include "Names/PropertyName.h"
#include "Names/ValueLines.h"

#include "Support/Documents.h"
#include "Support/ObjectText.h"

#include <gtest/gtest.h>

namespace {

using namespace ovrin;
using documents::Node;
using documents::PathOf;
using object_text::Scene;
using namespace ovrin_yaml;

const char* const kScene = R"(
1 &1 GameObject: {m_Component: [{component: {fileID: 2}}, {component: {fileID: 3}}], m_Name: Gate}
4 &2 Transform: {m_GameObject: {fileID: 1}, m_Children: [{fileID: 2}, {fileID: 9}], m_Pair: {x: 1}}
114 &3 MonoBehaviour: {m_GameObject: {fileID: 1}, m_Slots: [{name: left hand, item: {deep: [1]}}], m_List: [a, b]}
21 &4 PrefabInstance: {m_Modification: {m_Modifications: [{target: {fileID: 8, guid: ab}, propertyPath: m_Name, value: Lantern}, {target: {fileID: 8, guid: ab}, propertyPath: m_Layer, value: 1}]}}
)";

std::string Line(const std::string& value, std::size_t width = 0) {
    Scene scene(kScene);
    return ValueLine(*Node(value), ObjectNames(scene.Root()), width);
}

TEST(ValueLine, ReferencesAreNamed) {
    EXPECT_EQ(Line("{fileID: 1}"), "→ Gate (1)");
    EXPECT_EQ(Line("{fileID: 0}"), "none");
    EXPECT_EQ(Line("{fileID: 77}"), "→ (missing 77)");
    EXPECT_EQ(Line("{fileID: 21, guid: 4f0c2b7de19a48f6, type: 3}"), "→ file 4f0c2b7d (21)");
    EXPECT_EQ(Line("{a: {fileID: 2}, b: [1, {c: 'x, y'}]}"),
              "{a: → Gate · Transform (2), b: [1, {c: \"x, y\"}]}");
}

TEST(ValueLine, TextsAreOneLineAndTellTheirBlanks) {
    EXPECT_EQ(Line("4.5"), "4.5");
    EXPECT_EQ(Line("''"), "\"\"");
    EXPECT_EQ(Line("' a'"), "\" a\"");
    EXPECT_EQ(Line("\"a\\nb\""), "a\\nb");
}

TEST(ValueLine, WidthCutsBetweenCharacters) {
    EXPECT_EQ(Line("Träger", 4), "Trä…");
    EXPECT_EQ(Line("Träger", 6), "Träger");
    EXPECT_EQ(Line("[1, 2, 3, 4, 5, 6]", 8), "[1, 2, …");
}

TEST(ValueLines, TellTheWholeValue) {
    Scene scene(kScene);
    const auto lines = ValueLines(*Node("a: 1\nb:\n- c: {fileID: 1}\n  d: \"x\\ny\"\ne: {f: [1, 2]}"),
                                  ObjectNames(scene.Root()));
    EXPECT_EQ(lines, (std::vector<std::string>{"a: 1", "b:", "  - c: → Gate (1)", "    d: |", "      x",
                                               "      y", "e: {f: [1, 2]}"}));
}

std::string Property(const std::string& path) {
    Scene scene(kScene);
    MergeRules rules;
    rules.AddSequenceUniqueKeys(SequenceType::Set, PathOf("*.MonoBehaviour.m_Slots"), {PathOf("name")});
    rules.AddSequenceUniqueKeys(SequenceType::Set, PathOf("*.PrefabInstance.m_Modification.m_Modifications"),
                                {PathOf("target.fileID"), PathOf("propertyPath")});
    rules.AddSequenceUniqueKeys(SequenceType::Set, PathOf("*.GameObject.m_Component"), {PathOf("*.fileID")});
    const ObjectNames names(scene.Root());
    return PropertyNames(names, rules).Name(PathOf(path));
}

TEST(PropertyNames, ElementsAreToldByTheirKeys) {
    EXPECT_EQ(Property("2.Transform.m_Pair.x"), "m_Pair.x");
    EXPECT_EQ(Property("2.Transform.m_Children.0"), "m_Children[Gate]");
    EXPECT_EQ(Property("2.Transform.m_Children.1"), "m_Children[(missing 9)]");
    EXPECT_EQ(Property("1.GameObject.m_Component.1"), "m_Component[MonoBehaviour]");
    EXPECT_EQ(Property("3.MonoBehaviour.m_Slots.0.item.deep.0"), "m_Slots[left hand].item.deep[0]");
    EXPECT_EQ(Property("3.MonoBehaviour.m_List.1"), "m_List[1]");
    EXPECT_EQ(Property("4.PrefabInstance.m_Modification.m_Modifications.1.value"),
              "m_Modification.m_Modifications[Lantern · m_Layer].value");
}

TEST(PropertyNames, WhatIsntThereIsToldByItsPath) {
    EXPECT_EQ(Property("2"), "");
    EXPECT_EQ(Property("2.Transform"), "");
    EXPECT_EQ(Property("99.Transform.m_A.3"), "Transform.m_A[3]");
    EXPECT_EQ(Property("3.MonoBehaviour.m_List.7.a"), "m_List[7].a");
}

} // namespace
