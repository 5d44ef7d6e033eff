#pragma once

#include <string>
#include <string_view>

namespace ovrin_fuzz {

struct MergeTexts {
    std::string base, left, right; // whole files
};

/// The three files of an input. Parts of an input are divided by lines "=======":
///  - three parts are base, left and right;
///  - of two parts the first is the base, and the second tells how the sides differ from it: each four bytes
///    are an edit of one line;
///  - with one part all three are the same.
/// A part that doesn't begin with "%YAML" gets the header lines of an object file in front.
MergeTexts TextsOfInput(std::string_view input);
/// An input of three parts; the usual header lines are left out.
std::string InputOfTexts(const MergeTexts& texts);

} // namespace ovrin_fuzz
