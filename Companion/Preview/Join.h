#pragma once

#include "Preview/Answer.h"

namespace ovrin {

/// A part of an answer, and the file that it came from.
struct AnswerFile {
    std::string name;
    PreviewAnswer answer;
};

/// Puts the parts of an answer together, which may come in any order: the same as if one machine had
/// answered. Throws Failure unless they are all parts of one question, each once.
PreviewAnswer Join(std::vector<AnswerFile> files);

} // namespace ovrin
