#pragma once

#include <string>
#include <vector>

namespace ovrin {

/// The files of this user that earlier merges left in the temporary directory: older than an hour, and in no
/// process's hands as far as that can be told, since a tool may show one for a long time.
std::vector<std::string> ForgottenTemporaryFiles();

} // namespace ovrin
