#pragma once

#include "Reading/PartReading.h"
#include "Reading/TextWindow.h"

#include <cstddef>
#include <functional>
#include <string>

namespace ovrin_yaml {

/// An object file that is to be read, wherever it is.
struct InputFile {
    std::string name; ///< in messages
    /// Bytes; 0 if that can't be told beforehand. Such a file may be a pipe: `take` is called on a thread of
    /// its own then.
    std::size_t size;
    /// Gives the bytes of the whole file. Called once at most, on any thread; may throw.
    std::function<std::string()> take;
    /// Where there is one, begins to read the file from its start, for those who need not have it in memory
    /// as a whole: `take` may still be called afterwards. On any thread; may throw.
    std::function<ByteSource()> open = {};
    /// Where there is one, begins to read the file in parts, in any order. As `open` otherwise.
    std::function<PartSource()> openParts = {};
};

/// A file that is in memory already.
inline InputFile TextInput(std::string name, std::string text) {
    const std::size_t size = text.size();
    return {std::move(name), size, [text = std::move(text)]() mutable { return std::move(text); }, {}, {}};
}

} // namespace ovrin_yaml
