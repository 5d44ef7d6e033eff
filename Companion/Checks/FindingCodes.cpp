#include "Checks/FindingCodes.h"

#include <algorithm>
#include <iterator>

namespace ovrin {

namespace {

constexpr CodeInfo kTable[] = {
    {Code::Unreadable, "unreadable", Severity::Error, "The scene can't be read",
     "The text isn't what a scene may be from the named place on, so that neither the editor nor a merge can "
     "use "
     "it. Most often somebody edited it by hand, or a merge by lines broke it. Letters that "
     "aren't ASCII stand escaped in scenes: where they don't, let the editor save the file again. Otherwise "
     "repair the text there, or take the file from an earlier version."},
    {Code::ConflictMarkers, "conflict-markers", Severity::Error, "Conflict markers of a merge by lines",
     "A merge by lines stopped here and nobody settled it. Take the merge back and merge again with ovrin as "
     "the driver (\"ovrin setup\"), or take one side's whole file. Deleting the markers alone leaves both "
     "sides' lines, mixed."},
    {Code::OpenConflict, "open-conflict", Severity::Error, "A merge that has open conflicts",
     "Both sides changed the same values, and nobody has decided yet which of them stay. \"ovrin status\" "
     "lists "
     "such scenes, \"ovrin settle\" settles them."},
    {Code::LfsPointer, "lfs-pointer", Severity::Error, "A pointer of Git LFS in place of the scene",
     "The file holds three lines that name the scene's content, not the content. Get it with \"git lfs "
     "pull\". "
     "Scenes that are to be merged by their objects must not be kept by LFS: take them out of "
     ".gitattributes, "
     "and migrate them with \"git lfs migrate export\"."},
    {Code::Binary, "binary", Severity::Error, "Not a text",
     "The file holds NUL bytes, which no text does: the editor saves scenes in its binary form, or the file "
     "was "
     "damaged. Let the editor save scenes as text, and save it again."},
    {Code::Empty, "empty", Severity::Error, "No byte at all",
     "An empty file is no scene. Take it from an earlier version, or remove it."},
    {Code::NoScene, "no-scene", Severity::Error, "Not a scene",
     "The text doesn't begin with %YAML as scenes do. Let the editor save it again, or, if it is something "
     "else, "
     "give it another name."},
    {Code::RepeatedId, "repeated-id", Severity::Error, "Two objects have the same id",
     "References can't tell them apart, so the editor keeps one of them at most, and a merge refuses the "
     "file. "
     "It comes from objects that were copied as text, or from a merge by lines that added an object twice. "
     "If "
     "they say the same, delete one; otherwise give one of them an id of its own and adapt what refers to "
     "it."},
    {Code::RepeatedKey, "repeated-key", Severity::Error, "A mapping has a key twice",
     "Only one of the values can count, and which one is nobody's promise; a merge refuses the object. It "
     "comes "
     "from a merge by lines. Delete the line that is wrong."},
    {Code::DanglingReference, "dangling-reference", Severity::Error,
     "A reference to an object that isn't there",
     "The field names an object of this file by its id, and there is none. The editor takes it for nothing. "
     "The "
     "object was deleted on one side of a merge while the other side began to use it, or a text was copied "
     "without what it needs. Bring the object back, or set the field anew."},
    {Code::FatherLacksChild, "father-lacks-child", Severity::Error, "The parent doesn't list this Transform",
     "m_Father of a Transform and m_Children of its parent must say the same. Here the parent doesn't list "
     "the "
     "child, which the editor may lose or move to another place. Add it to m_Children, or set m_Father to "
     "the "
     "Transform that lists it."},
    {Code::FatherIsNoTransform, "father-is-no-transform", Severity::Error, "The parent isn't a Transform",
     "m_Father names an object of another class, under which nothing can stand. Set it to the Transform of "
     "that "
     "object."},
    {Code::ChildOfAnother, "child-of-another", Severity::Error, "A listed child names another parent",
     "m_Children lists a Transform whose m_Father is another one. Both sides of a merge may have moved it. "
     "Decide "
     "where it belongs: take it out of this list, or set its m_Father."},
    {Code::RepeatedChild, "repeated-child", Severity::Error, "A child is listed twice",
     "m_Children names the same Transform more than once. Delete all entries but one."},
    {Code::ParentLoop, "parent-loop", Severity::Error, "A Transform is its own ancestor",
     "Following m_Father upward comes back to where it began, so none of these objects stands in the scene. "
     "Two "
     "sides of a merge put each other's objects below their own. Give one of them another parent."},
    {Code::ComponentNotListed, "component-not-listed", Severity::Error,
     "The GameObject doesn't list this component",
     "m_GameObject of a component and m_Component of its GameObject must say the same. Here the list lacks "
     "the "
     "component, which the editor then drops. Add it to the list, or delete the component."},
    {Code::OwnerIsNoGameObject, "owner-is-no-game-object", Severity::Error,
     "The component's owner isn't a GameObject",
     "m_GameObject names an object of another class. Set it to the GameObject whose m_Component lists the "
     "component."},
    {Code::ComponentOfAnother, "component-of-another", Severity::Error,
     "A listed component names another owner",
     "m_Component lists a component whose m_GameObject is another one. Take it out of the list, or set its "
     "m_GameObject."},
    {Code::RepeatedComponent, "repeated-component", Severity::Error, "A component is listed twice",
     "m_Component names the same component more than once. Delete all entries but one."},
    {Code::MissingComponent, "missing-component", Severity::Error, "A required component is missing",
     "By the type information a component of the GameObject needs another one beside it, which isn't there: "
     "somebody removed it while another needed it. Add it in the editor, or remove what requires it."},
    {Code::NotAsWritten, "not-as-written", Severity::Warning, "Not in the form that is written",
     "The scene can be read, but its text isn't what the editor and a merge would write for it: it was "
     "edited by "
     "hand, its line ends were changed, or another program wrote it. It says the same, but the next save "
     "changes "
     "lines that nobody meant to change. Let the editor save it again, and see that version control leaves "
     "its "
     "line ends alone (\"-text\" in .gitattributes)."},
};

constexpr bool IsInOrder() {
    for (std::size_t i = 0; i < std::size(kTable); ++i)
        if (kTable[i].code != static_cast<Code>(i)) return false;
    return std::size(kTable) == static_cast<std::size_t>(Code::NotAsWritten) + 1;
}
static_assert(IsInOrder());

} // namespace

std::span<const CodeInfo> CodeTable() {
    return kTable;
}

const CodeInfo& InfoOf(Code code) {
    return kTable[static_cast<std::size_t>(code)];
}

const CodeInfo* FindCode(std::string_view name) {
    const auto found =
        std::ranges::find(kTable, name, [](const CodeInfo& info) -> std::string_view { return info.name; });
    return found == std::end(kTable) ? nullptr : found;
}

} // namespace ovrin
