#include "SceneObjects.h"

#include <algorithm>

namespace ovrin_bench {
namespace {

const char* const kNames[] = {"Lantern",      "Gate", "North tower", "crate_small", "Bridge",
                              "mossy_stone",  "Well", "Banner",      "Orchard",     "Stair",
                              "harbour_wall", "Mill", "Rope",        "Roof"};

const char* const kWords[] = {"the",   "old",   "keeper", "walks", "along", "sea",     "wall",  "every",
                              "night", "and",   "boat",   "wind",  "turns", "vane",    "rain",  "lamp",
                              "salt",  "two",   "names",  "count", "quiet", "harbour", "under", "stone",
                              "green", "light", "before", "door",  "of",    "a"};

const char* const kFields[] = {"m_Speed",   "m_Reach",  "m_Title",    "m_Note", "m_Entries", "m_Targets",
                               "m_Words",   "m_Offset", "m_Settings", "m_Tint", "m_Mode",    "m_Delay",
                               "m_OnEnter", "m_Curve",  "m_Limit",    "m_Icon"};

const char* const kPropertyPaths[] = {
    "m_LocalPosition.x", "m_LocalPosition.y", "m_LocalRotation.w", "m_Name",
    "m_Visible",         "m_Speed",           "m_Entries.1.label", "m_Reach"};

const char* const kLayers[] = {"Plain", "Ground", "Walker", "Hidden"};

/// The texts one behind the other. Unlike the operands of +, the elements of a list are evaluated in order,
/// which the random numbers in them need.
std::string Joined(std::initializer_list<std::string> texts) {
    std::string joined;
    for (const std::string& text : texts) joined += text;
    return joined;
}

std::string Hex(SceneRandom& random, std::size_t digits) {
    std::string text;
    while (text.size() < digits) text += "0123456789abcdef"[random.Below(16)];
    return text;
}

std::string Integer(SceneRandom& random, std::uint64_t count) {
    return std::to_string(random.Below(count));
}

std::string Sentence(SceneRandom& random, std::size_t words) {
    std::string text = random.Pick(kWords);
    for (std::size_t i = 1; i < words; ++i) (text += ' ') += random.Pick(kWords);
    return text;
}

SceneValue Colour(SceneRandom& random) {
    return FlowMapping({{"r", RandomNumber(random)}, {"g", RandomNumber(random)}, {"b", "1"}, {"a", "1"}});
}

SceneValue Entry(SceneRandom& random) {
    SceneValue entry = Mapping();
    entry.Add("label", Text(random.Below(4) == 0 ? "" : RandomName(random)));
    entry.Add("amount", Text(RandomNumber(random)));
    if (random.Below(2) == 0) entry.Add("asset", AssetReference(random));
    return entry;
}

SceneValue Settings(SceneRandom& random) {
    SceneValue settings = Mapping();
    settings.Add("on", Text(Integer(random, 2))).Add("density", Text(RandomNumber(random)));
    settings.Add("centre", RandomVector(random)).Add("hint", Text(RandomNote(random)));
    return settings;
}

SceneValue CurveKey(SceneRandom& random) {
    SceneValue key = Mapping();
    key.Add("time", Text(RandomNumber(random))).Add("value", Text(RandomNumber(random)));
    return key.Add("slope", FlowMapping({{"in", RandomNumber(random)}, {"out", RandomNumber(random)}}));
}

template <class Make> SceneValue ListOf(SceneRandom& random, std::uint64_t most, Make make) {
    SceneValue list = List();
    for (std::uint64_t count = random.Below(most + 1); count > 0; --count) list.items.push_back(make(random));
    return list;
}

SceneValue FieldValue(SceneRandom& random, const std::string& name) {
    if (name == "m_Title") return Text(RandomName(random));
    if (name == "m_Note") return Text(RandomNote(random));
    if (name == "m_Entries") return ListOf(random, 6, Entry);
    if (name == "m_Targets") return ListOf(random, 4, AssetReference);
    if (name == "m_Words") return ListOf(random, 8, [](SceneRandom& r) { return Text(r.Pick(kWords)); });
    if (name == "m_Offset") return RandomVector(random);
    if (name == "m_Settings") return Settings(random);
    if (name == "m_Tint") return Colour(random);
    if (name == "m_Mode") return Text(Integer(random, 7));
    if (name == "m_OnEnter") return Text("");
    if (name == "m_Curve") return Mapping().Add("points", ListOf(random, 5, CurveKey)).Add("loop", Text("1"));
    if (name == "m_Icon") return AssetReference(random);
    return Text(RandomNumber(random));
}

SceneValue Modification(SceneRandom& random, const std::string& guid) {
    SceneValue modification = Mapping();
    std::string target = LongID(random);
    modification.Add("target", FlowMapping({{"fileID", target}, {"guid", guid}, {"type", "3"}}));
    modification.Add("propertyPath", Text(random.Pick(kPropertyPaths)));
    modification.Add("value", Text(random.Below(5) == 0 ? "" : RandomNumber(random)));
    return modification.Add("objectReference", Reference(0));
}

SceneObject Make(std::int64_t id, int classID, const char* className) {
    SceneObject object;
    object.id = id;
    object.classID = classID;
    object.className = className;
    object.fields.Add("m_PrefabInternal", Reference(0));
    return object;
}

} // namespace

std::string LongID(SceneRandom& random) {
    return std::to_string(1000000000000000000u + random.Below(8000000000000000000u));
}

std::int64_t SceneIDs::Take() {
    // Multiplication modulo a prime visits every residue once before it comes round.
    return static_cast<std::int64_t>(++m_Count * 1640531527u % 2147483629u);
}

std::string RandomName(SceneRandom& random) {
    std::string name = random.Pick(kNames);
    if (random.Below(2) == 0) name += Joined({" (", Integer(random, 100), ")"});
    return name;
}

std::string RandomNumber(SceneRandom& random) {
    std::string sign = random.Below(3) == 0 ? "-" : "";
    switch (random.Below(8)) {
    case 0:
        return "0";
    case 1:
        return sign + std::to_string(1 + random.Below(50));
    case 2:
        return Joined({sign, Integer(random, 9), ".", std::to_string(1000000 + random.Below(9000000)), "e-0",
                       std::to_string(5 + random.Below(4))});
    default:
        return Joined({sign, Integer(random, 100), ".", std::to_string(1 + random.Below(99999))});
    }
}

std::string RandomNote(SceneRandom& random) {
    switch (random.Below(12)) {
    case 0:
        return "";
    case 1:
        return Joined({"Note ", Integer(random, 1000), ": ", Sentence(random, 4 + random.Below(30))});
    case 2:
        return "- " + Sentence(random, 5);
    case 3:
        return Joined({"[", Sentence(random, 2), "] isn't ", Sentence(random, 3)});
    case 4:
        return Joined({Sentence(random, 3), "\t\"", Sentence(random, 1 + random.Below(25)), "\"\n\\"});
    case 5:
        return Joined({Sentence(random, 6), "\n", Sentence(random, 20), "\n\n", Sentence(random, 4)});
    case 6:
    case 7:
        return Sentence(random, 15 + random.Below(60));
    default:
        return Sentence(random, 2 + random.Below(8));
    }
}

SceneValue RandomVector(SceneRandom& random) {
    return FlowMapping(
        {{"x", RandomNumber(random)}, {"y", RandomNumber(random)}, {"z", RandomNumber(random)}});
}

SceneValue AssetReference(SceneRandom& random) {
    constexpr std::uint64_t assets = 1 << 16; // scenes use the same assets again and again
    SceneRandom asset(random.Below(assets));
    std::string type = random.Below(2) == 0 ? "2" : "3";
    std::string id =
        random.Below(3) == 0 ? "-" + LongID(random) : std::to_string(5100000 + 100 * random.Below(50));
    return FlowMapping({{"fileID", id}, {"guid", Hex(asset, 32)}, {"type", type}});
}

SceneObject MakeGameObject(SceneRandom& random, std::int64_t id) {
    SceneObject object = Make(id, 1, "GameObject");
    object.fields.Add("m_Component", List()).Add("m_Layer", Text(Integer(random, 32)));
    object.fields.Add("m_Name", Text(RandomName(random))).Add("m_Tag", Text(random.Pick(kLayers)));
    object.fields.Add("m_Visible", Text(Integer(random, 2)));
    return object;
}

SceneObject MakeTransform(SceneRandom& random, std::int64_t id, std::int64_t gameObject,
                          std::int64_t father) {
    SceneObject object = Make(id, 4, "Transform");
    object.fields.Add("m_GameObject", Reference(gameObject));
    SceneValue rotation = RandomVector(random);
    object.fields.Add("m_LocalRotation", rotation.Add("w", Text(RandomNumber(random))));
    object.fields.Add("m_LocalPosition", RandomVector(random));
    object.fields.Add("m_LocalScale", FlowMapping({{"x", "1"}, {"y", "1"}, {"z", RandomNumber(random)}}));
    object.fields.Add("m_Children", List()).Add("m_Father", Reference(father));
    object.fields.Add("m_Order", Text(Integer(random, 40)));
    return object;
}

SceneObject MakeMeshRenderer(SceneRandom& random, std::int64_t id, std::int64_t gameObject) {
    SceneObject object = Make(id, 23, "MeshRenderer");
    object.fields.Add("m_GameObject", Reference(gameObject)).Add("m_On", Text("1"));
    object.fields.Add("m_Shadows", Text(Integer(random, 4)))
        .Add("m_Materials", ListOf(random, 3, AssetReference));
    object.fields.Add("m_Anchor", Reference(0)).Add("m_Blend", Text(RandomNumber(random)));
    object.fields.Add("m_Rank", Text(Integer(random, 10)));
    return object;
}

SceneObject MakeMonoBehaviour(SceneRandom& random, std::int64_t id, std::int64_t gameObject) {
    SceneObject object = Make(id, 114, "MonoBehaviour");
    object.fields.Add("m_GameObject", Reference(gameObject)).Add("m_On", Text("1"));
    object.fields.Add("m_Script", AssetReference(random)).Add("m_Name", Text(""));
    for (const char* name : kFields)
        if (random.Below(2) == 0) object.fields.Add(name, FieldValue(random, name));
    object.fields.Add("m_Rank", Text(Integer(random, 10))).Add("m_Weight", Text(RandomNumber(random)));
    return object;
}

SceneObject MakePrefabInstance(SceneRandom& random, std::int64_t id, std::int64_t parent) {
    SceneObject object = Make(id, 21, "PrefabInstance");
    SceneValue modification = Mapping();
    SceneValue source = AssetReference(random);
    std::string guid = source.Find("guid")->text;
    modification.Add("m_TransformParent", Reference(parent));
    modification.Add("m_Modifications",
                     ListOf(random, 12, [&](SceneRandom& r) { return Modification(r, guid); }));
    modification.Add("m_Dropped", List());
    object.fields.Add("m_Modification", modification).Add("m_Source", source);
    object.fields.Add("m_Rank", Text(Integer(random, 10)));
    return object;
}

SceneObject MakeStrippedTransform(SceneRandom& random, std::int64_t id, std::int64_t prefabInstance) {
    SceneObject object;
    object.id = id;
    object.classID = 4;
    object.className = "Transform";
    object.stripped = true;
    object.fields.Add("m_Source", AssetReference(random)).Add("m_PrefabInternal", Reference(prefabInstance));
    return object;
}

SceneObject MakeStateMachine(SceneRandom& random, std::int64_t id, std::int64_t otherMachine) {
    SceneObject object = Make(id, 31, "AnimatorStateMachine");
    SceneValue transition = Mapping();
    transition.Add("first", Reference(otherMachine)).Add("second", List());
    transition.Find("second")->items = {AssetReference(random), AssetReference(random)};
    object.fields.Add("m_Name", Text(RandomName(random)))
        .Add("m_Steps", ListOf(random, 4, [](SceneRandom& r) {
                 SceneValue step = Mapping();
                 return step.Add("m_Step", AssetReference(r)).Add("m_Place", RandomVector(r));
             }));
    object.fields.Add("m_AnyLinks", ListOf(random, 3, AssetReference));
    SceneValue transitions = Mapping();
    if (random.Below(2) == 0) transitions.Add("data", transition);
    object.fields.Add("m_StateMachineTransitions", transitions).Add("m_EntryPlace", RandomVector(random));
    return object;
}

SceneValue ComponentEntry(std::int64_t component) {
    return Mapping().Add("component", Reference(component));
}

void AddToList(SceneObject& object, const std::string& name, SceneValue element) {
    object.fields.Find(name)->items.push_back(std::move(element));
}

void RemoveFromList(SceneObject& object, const std::string& name, const SceneValue& element) {
    std::vector<SceneValue>& items = object.fields.Find(name)->items;
    auto found = std::find(items.begin(), items.end(), element);
    if (found != items.end()) items.erase(found);
}

} // namespace ovrin_bench
