#pragma once

#include "Values/YAMLError.h"

#include <cstdint>
#include <string>

namespace ovrin_yaml {

/// What a session couldn't do, and where. The text of the error says it in one sentence; whoever wants to
/// word it in another way takes the parts.
class MergeError final : public YAMLError {
public:
    enum class Stage { Read, Prepare, Diff, Merge, Apply, Repair };

    Stage stage;
    std::string file;   ///< the name of the file at fault; empty if it is not one file alone
    std::string reason; ///< the fault, without the file

    MergeError(Stage at, std::string fileName, std::string fault, std::string text)
        : YAMLError(std::move(text)), stage(at), file(std::move(fileName)), reason(std::move(fault)) {}
};

} // namespace ovrin_yaml
