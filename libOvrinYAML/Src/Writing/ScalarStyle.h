#pragma once

#include <string_view>

namespace ovrin_yaml {

class YAMLScalar;

/// What a scalar's text allows. Double quotes are always allowed.
struct ScalarForms {
    bool plainInBlock = true;
    bool plainInFlow = true; // inside [...] or {...}
    bool singleQuoted = true;
    bool lineBreaks = false; // line feed, carriage return, U+0085, U+2028 or U+2029 stand in the text

    bool operator==(const ScalarForms&) const = default;
};

/// Classifies a text, in time linear in its length. The empty text is plain in block context only.
ScalarForms ClassifyScalar(std::string_view text);
/// The same for a scalar, which remembers it: keys and many values are written again and again.
ScalarForms FormsOf(const YAMLScalar& scalar);

} // namespace ovrin_yaml
