#pragma once

#include "ErrorOf.h"
#include "Values/OvrinObjects.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <string>

/// Documents as text, on their way in and out of tests. Trees that are returned live until the process ends.
namespace documents {

using namespace ovrin_yaml;
using failures::ErrorOf;

/// The tree of a YAML text, hashed as the reader does it: Doc("a: 1\nl: [1, 2]").
YAMLNode* Node(const std::string& text);
YAMLMapping* Doc(const std::string& text);
YAMLSequence* List(const std::string& text);
/// A path as the report writes it.
Path PathOf(const std::string& text);

/// A tree on one line, in flow form whatever its own is, with "~" for a hole: "{a: 1, l: [1, ~]}".
std::string Show(const YAMLNode* node);
/// The same with all that a reader makes: flow form in brackets, else in "<>", lines and hashes of
/// containers.
std::string Dump(const YAMLNode* node);

/// An object file of the given documents: Objects("--- !o!1 &2\na: 1\n").
std::string ObjectText(const std::string& documents);
std::string Written(const OvrinObjects& objects);

/// The failure of reading a text, or "none".
std::string ReadError(const std::string& text);
/// What reading and writing a text gives.
std::string ReadAndWrite(const std::string& text);

} // namespace documents
