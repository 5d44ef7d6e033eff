#pragma once

#include "Values/YAMLError.h"

#include <cstdint>
#include <string>

namespace ovrin_yaml {

/// What a session couldn't do, and where: at what stage, and with which file and object as far as they are
/// known. The text of the error says it in one sentence; whoever wants to
/// word it in another way takes the parts.
class MergeError final : public YAMLError {
public:
    enum class Stage { Read, Prepare, Diff, Merge, Apply, Repair };

    Stage stage;
    std::string file;   ///< the name of the file at fault; empty if it is not one file alone
    std::string reason; ///< the fault, without the file

    /// `text` is that of the error; the place is the reason's.
    MergeError(Stage at, std::string fileName, const YAMLError& fault, std::string text)
        : YAMLError(std::move(text)), stage(at), file(std::move(fileName)), reason(fault.what()) {
        SetPlace(fault.Object(), fault.Line());
    }
};

} // namespace ovrin_yaml
