#pragma once

#include "Reading/ReaderOptions.h"
#include "Values/OvrinObjects.h"

#include <string>

namespace ovrin_yaml {

/// Reads the text of an object file into `objects`, which must be empty.
///
///     header              everything before the first "---", normally the %YAML and %TAG lines
///     --- !o!4 &12        a document for each object: class id 4, file id 12, optionally " stripped"
///     Transform:          its body, a block mapping
///       m_Father: {fileID: 0}
///
/// The text is cut at the document headers and each document is parsed by itself, with the header in front.
/// Positions count characters of the parser as bytes: text that is no ASCII in a document with a successor is
/// a read failure. Hashes are built on the way.
/// Throws YAMLError with the library's problem text or one of this reader's; `objects` then holds what came
/// before. Throws std::bad_alloc where there is no memory.
void ParseYAMLString(std::string text, OvrinObjects& objects, ReaderOptions options = {});

/// The same for the bytes of a whole file: tests the signature first, and takes the text up to the first NUL.
void ParseYAMLFile(std::string bytes, OvrinObjects& objects, ReaderOptions options = {});

} // namespace ovrin_yaml
