#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace ovrin {

/// What the bytes of a file are to a program that wants a scene.
enum class SceneKind {
    Scene,      ///< a text with the signature of object files; whether it can be read is another question
    Empty,      ///< no byte at all
    Markers,    ///< a scene into which a merge by lines wrote its conflict markers
    LfsPointer, ///< what Git LFS keeps in place of a file
    Binary,     ///< holds a NUL, which no text does
    NoScene,    ///< a text without the signature
};

/// Takes a look at the bytes of a whole file. Conflict markers count at the start of a line only: further in
/// they may be part of a value. A text without the signature holds some if it holds a whole conflict.
SceneKind ClassifyScene(std::string_view bytes);

/// Where the first conflict marker begins, "<<<<<<< ", "||||||| ", "=======" or ">>>>>>> " at the start of a
/// line; npos if there is none.
std::size_t FindMarker(std::string_view bytes);

/// What to do about a scene that the engine can't read. It goes by characters and bytes as if they were the
/// same, which holds for what the editor writes.
inline constexpr const char* kCureOfUnreadable =
    "; let the editor save it again, which escapes letters that aren't ASCII";

/// One sentence for people: what the file `name` is, and what to do next. Without a full stop.
std::string TellKind(const std::string& name, SceneKind kind);

/// Whether the name of a file ends as those of scenes do.
bool IsSceneName(const std::string& path);

} // namespace ovrin
