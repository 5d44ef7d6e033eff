#pragma once

#include "Settle/Web/PageFiles.h"

#include <span>
#include <string>
#include <string_view>

namespace ovrin {

/// Puts JavaScript modules together into one script that does what importing `main` does. Each module becomes
/// a function of its own, so that their names don't meet, in the order in which they need each other:
///
///     const module1 = (() => {
///     ...                                        what "words.js" says
///     return { counted };
///     })();
///     const module2 = (() => {
///     const { counted } = module1;               import { counted } from "./words.js";
///
/// Of the language's forms those are known that begin a line, `import { a, b as c } from "./name.js";`,
/// `import "./name.js";`, and `export` ahead of a function, a class or a const of one name. Throws Failure
/// for any other, for modules that need each other in a ring, and for one that isn't there.
std::string BundleModules(std::span<const PageFile> files, std::string_view main);

} // namespace ovrin
