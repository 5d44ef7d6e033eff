#pragma once

#include "Values/OvrinObjects.h"
#include "Values/TaskRunner.h"

#include <iosfwd>
#include <string>
#include <string_view>

namespace ovrin_yaml {

/// Appends the body of an object as YAML, without the data of its header and without a final line break. What
/// stands below the object's own keys may repeat keys. Throws the duplicate-keys text if those do.
void AppendObjectBody(const YAMLMapping& object, std::string& text);

/// Appends an object as it stands in a file, with its header line; its id is that of its header's data, or
/// else `rootKey`. Throws as Output does.
void AppendObject(const YAMLScalar& rootKey, const YAMLMapping& object, std::string& text);

/// The domain name in the second line of every file that is written; the build decides.
std::string_view TagAuthority();

/// Writes an object file as the editor does. Throws YAMLError "Object has no class id: " and the id's text
/// when an object lost the entry, and the duplicate-keys text when an object holds repeated keys at its top.
/// Where there is a `run`, it is for many objects that were changed.
void Output(const OvrinObjects& objects, std::ostream& stream, const TaskRunner& run = {});

} // namespace ovrin_yaml
