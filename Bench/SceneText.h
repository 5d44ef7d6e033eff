#pragma once

#include <cstdint>
#include <string>
#include <utility>
#include <vector>

namespace ovrin_bench {

/// A value of a generated object: a text, a mapping or a list. Plain data, copied freely.
struct SceneValue {
    enum class Kind { Text, Mapping, List };

    Kind kind = Kind::Text;
    bool flow = false; ///< collections only: written `{a: 1}` or `[a, b]`; block style needs an entry
    std::string text;  ///< texts only; printable ASCII, tabs and line feeds
    std::vector<std::string> keys; ///< mappings only: the key of each item; short plain words
    std::vector<SceneValue> items;

    bool operator==(const SceneValue& other) const = default;

    /// Appends an entry to a mapping and returns the mapping.
    SceneValue& Add(std::string key, SceneValue value);
    /// The value of a mapping's key; null if there is none.
    SceneValue* Find(const std::string& key);
    const SceneValue* Find(const std::string& key) const;
};

SceneValue Text(std::string text);
SceneValue Mapping();
SceneValue List();
/// A flow mapping of texts, such as `{x: 0, y: 1}`.
SceneValue FlowMapping(std::vector<std::pair<std::string, std::string>> entries);
/// `{fileID: id}`, a reference within the file.
SceneValue Reference(std::int64_t id);

/// One document of an object file.
struct SceneObject {
    std::int64_t id = 0;
    int classID = 0;
    std::string className;
    bool stripped = false;
    SceneValue fields = Mapping(); ///< what stands below the class name; must not be empty
};

/// The two lines that every object file starts with.
extern const char* const kFileHeader;

/// The document of an object in written form, header line and final line end included: the bytes that a
/// reader followed by a writer gives back. Lists directly inside lists are not supported.
std::string WrittenForm(const SceneObject& object);

} // namespace ovrin_bench
