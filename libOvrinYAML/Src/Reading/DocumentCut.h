#pragma once

#include <string_view>

namespace ovrin_yaml {

// Where the parts of an object file begin and end, without reading them.
//
//     %YAML 1.1
//     %TAG !o! tag:ovrin.dev,2011:     header, up to the first "---"
//     --- !o!4 &12                     document, up to the next line that begins with "--- !o!"
//     Transform:
//     ...

/// Whether the bytes of a file begin as those of object files do. A byte order mark may stand in front.
bool HasSignature(std::string_view bytes);

/// The header of a text; all of it if there is no document.
std::string_view FileHeaderOf(std::string_view text);

/// Whether the header has the form that the writer gives it, with nothing in the authority of its tags that
/// isn't plain in every sense, and a document in usual form follows.
bool HasWrittenHeader(std::string_view text);

/// The end of the document that begins at `begin`, in a text that ends at `end`.
const char* FindDocumentEnd(const char* begin, const char* end);

} // namespace ovrin_yaml
