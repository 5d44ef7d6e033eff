#include "FileEdits.h"

#include <algorithm>
#include <utility>
#include <vector>

namespace ovrin_fuzz {

namespace {

/// Words that the program treats in a way of their own, and some that mean nothing.
constexpr std::string_view kKeys[] = {"MERGE_FileID",
                                      "MERGE_ClassID",
                                      "MERGE_StrippedPrefab",
                                      "Transform",
                                      "RectTransform",
                                      "GameObject",
                                      "Prefab",
                                      "PrefabInstance",
                                      "m_Father",
                                      "m_Children",
                                      "m_Component",
                                      "m_GameObject",
                                      "m_PrefabInternal",
                                      "m_PrefabInstance",
                                      "m_Modification",
                                      "m_TransformParent",
                                      "AnimatorStateMachine",
                                      "m_StateMachineTransitions",
                                      "MonoBehaviour",
                                      "m_Script",
                                      "fileID",
                                      "guid",
                                      "data",
                                      "_",
                                      "*",
                                      "x",
                                      "p0",
                                      "b13183",
                                      "a278043",
                                      "v52289",
                                      "v63066"};

constexpr std::string_view kValues[] = {"0",
                                        "1",
                                        "{fileID: 0}",
                                        "{fileID: 11}",
                                        "{fileID: 13}",
                                        "{fileID: 11, guid: e}",
                                        "{}",
                                        "[]",
                                        "[{fileID: 1}, {fileID: 2}]",
                                        "[{fileID: 2}, {fileID: 1}]",
                                        "{x: 0, y: 0}",
                                        "{x: 0, y: 1}",
                                        "'a: b'",
                                        "\"\\xe9\"",
                                        "\xC3\xA9",
                                        "&a 1",
                                        "*a",
                                        "&a {x: 1}",
                                        "{k: 1, k: 2}",
                                        "",
                                        "a278043",
                                        "word word"};

/// Values that differ and have one hash: scalars, mappings, lists, and mappings whose lists of keys have one
/// (with a change of a value beside it).
constexpr std::string_view kTwins[][3] = {
    {"v52289", "v63066", "v52289"},
    {"81337", "124886", "0"},
    {"{a: 1, b: r27104}", "{k: w84188}", "{a: 1}"},
    {"[q, r5339]", "[w256325]", "[q, r5339, s]"},
    {"{p0: 1, b13183: 1}", "{a278043: 1}", "{p0: 2, b13183: 1}"},
    {"{v52289: 1}", "{v63066: 1}", "{v63066: 2}"},
};

std::vector<std::string_view> LinesOf(std::string_view text) {
    std::vector<std::string_view> lines;
    while (!text.empty()) {
        const std::size_t end = std::min(text.find('\n'), text.size() - 1) + 1;
        lines.push_back(text.substr(0, end));
        text.remove_prefix(end);
    }
    return lines;
}

std::size_t IndentOf(std::string_view line) {
    return std::min(line.find_first_not_of(" -"), line.size());
}

bool IsHeader(std::string_view line) {
    return line.starts_with("--- ");
}

/// A line with all that stands below it, in a file.
struct Block {
    std::size_t begin, end;
};

Block BlockAt(const std::string& file, std::size_t begin) {
    const auto lines = LinesOf(std::string_view(file).substr(begin));
    std::size_t end = begin + lines[0].size();
    const bool isObject = IsHeader(lines[0]);
    for (std::size_t i = 1; i < lines.size(); end += lines[i++].size())
        if (IsHeader(lines[i]) || (!isObject && IndentOf(lines[i]) <= IndentOf(lines[0]))) break;
    return {begin, end};
}

std::string WithKey(std::string_view line, const std::string& key) {
    const std::size_t colon = line.find(':');
    if (colon == line.npos) return std::string(line.substr(0, IndentOf(line))) + key + ": 0\n";
    return std::string(line.substr(0, IndentOf(line))) + key + std::string(line.substr(colon));
}

/// "{a: 1, b: 2}" in block form, its lines behind that of the key: braces are never merged inside.
std::string AsBlock(std::string_view flow, std::size_t indent) {
    std::string text;
    for (flow = flow.substr(1, flow.size() - 2); !flow.empty();) {
        const std::size_t end = std::min(flow.find(", "), flow.size());
        text += "\n" + std::string(indent, ' ') + std::string(flow.substr(0, end));
        flow.remove_prefix(std::min(end + 2, flow.size()));
    }
    return text;
}

std::string WithValue(std::string_view line, const std::string& value) {
    const std::size_t colon = line.find(':');
    const std::size_t begin = colon == line.npos ? IndentOf(line) : colon + 1;
    return std::string(line.substr(0, begin)) + (colon == line.npos ? "" : " ") + value + "\n";
}

/// Calls edit(file, block) where a file has the line.
template <class Change> void AtLine(std::span<std::string> files, std::string_view line, const Change& edit) {
    const std::string wanted(line);
    for (std::string& file : files) {
        std::size_t at = file.find(wanted);
        while (at != file.npos && at > 0 && file[at - 1] != '\n') at = file.find(wanted, at + 1);
        if (at != file.npos) edit(file, BlockAt(file, at));
    }
}

void Replace(std::string& file, Block block, std::string_view text) {
    file.replace(block.begin, block.end - block.begin, text);
}

} // namespace

std::string FileEdits::Key() {
    return std::string(OneOf(kKeys)) + (Below(4) ? "" : std::to_string(Below(40)));
}

std::string FileEdits::Value() {
    return Below(4) ? std::string(OneOf(kValues)) : std::to_string(Below(100));
}

void FileEdits::Edit(std::span<std::string> files) {
    if (Below(12) == 0)
        EditFrame(files[Below(files.size())]);
    else if (files.size() > 1 && Below(8) == 0)
        ShareObject(files);
    else
        EditLines(files);
}

void FileEdits::EditLines(std::span<std::string> files) {
    const auto lines = LinesOf(files[Below(files.size())]);
    if (lines.empty()) return;
    const std::string line(lines[Below(lines.size())]), other(lines[Below(lines.size())]);
    const std::size_t kind = Below(8);
    const std::string key = Key(), value = Value();
    if (kind == 0) return PutInTwins(files, line);
    // Some of the files that stand beside each other; of one file, that.
    const std::size_t first = Below(files.size());
    files = files.subspan(first, 1 + Below(files.size() - first));
    AtLine(files, line, [&](std::string& file, Block block) {
        const std::string text = file.substr(block.begin, block.end - block.begin);
        switch (kind) {
        case 1:
            return Replace(file, block, WithKey(text, key));
        case 2:
            return Replace(file, block, WithValue(line, value));
        case 3:
            return Replace(file, block, "");
        case 4: // once more, or an object of another id
            return void(file.insert(block.end, IsHeader(line) ? other : text));
        case 5:
            Replace(file, block, "");
            return AtLine({&file, 1}, other,
                          [&](std::string& to, Block place) { to.insert(place.begin, text); });
        case 6:
            return void(file.insert(block.end, line.substr(0, IndentOf(line)) + key + ": " + value + "\n"));
        default:
            return void(file.insert(block.begin, WithKey(WithValue(line, value), key)));
        }
    });
}

/// Each file gets one of three values that belong together.
void FileEdits::PutInTwins(std::span<std::string> files, std::string_view line) {
    const auto& twins = kTwins[Below(std::size(kTwins))];
    const bool inBlock = twins[0].starts_with('{') && Below(2);
    for (std::string& file : files) {
        std::string value(OneOf(twins));
        if (inBlock) value = AsBlock(value, IndentOf(line) + 2);
        AtLine({&file, 1}, line,
               [&](std::string& text, Block block) { Replace(text, block, WithValue(line, value)); });
    }
}

/// Gives all files an object of one of them, in the place of theirs or behind all: edits leave ever less that
/// is the same in all of them, which is read in a way of its own.
void FileEdits::ShareObject(std::span<std::string> files) {
    const std::string from = files[Below(files.size())];
    auto headers = LinesOf(from);
    std::erase_if(headers, [](std::string_view line) { return !IsHeader(line); });
    if (headers.empty()) return;
    const std::string_view header = headers[Below(headers.size())];
    const Block block = BlockAt(from, static_cast<std::size_t>(header.data() - from.data()));
    const std::string object = from.substr(block.begin, block.end - block.begin);
    for (std::string& file : files) {
        bool isThere = false;
        AtLine({&file, 1}, header, [&](std::string& text, Block theirs) {
            Replace(text, theirs, object);
            isThere = true;
        });
        if (!isThere) file += object;
    }
}

/// What stands around the objects.
void FileEdits::EditFrame(std::string& file) {
    const std::string id = std::to_string(10 + Below(9));
    switch (Below(7)) {
    case 0: // another tag handle
        file = "%YAML 1.1\n%TAG !x! tag:ovrin.dev,2011:\n" +
               file.substr(std::min(file.find("---"), file.size()));
        for (std::size_t at = 0; (at = file.find("!o!", at)) != file.npos;) file.replace(at, 3, "!x!");
        break;
    case 1: // comments ahead of the objects
        file.insert(std::min(file.find("---"), file.size()), "# c\n# d\n");
        break;
    case 2: // nothing that another file has
        file = "--- !o!114 &" + id + "\nMonoBehaviour:\n  x: " + Value() + "\n";
        break;
    case 3:
        file += "...\n";
        break;
    case 4:
        file += "--- !o!1 &" + id + " stripped\nGameObject:\n  " + Key() + ": \xE6\x97\xA5\n...\n";
        break;
    case 5: // an alias of another document's value
        file += "--- !o!1 &" + id + "\nGameObject: &a\n  x: *a\n";
        break;
    default:
        file.clear();
    }
}

} // namespace ovrin_fuzz
