#pragma once

#include "WebGate/RequestCheck.h"

#include <httplib.h>
#include <string>

namespace ovrin {

/// The headers of every answer. A page of ours runs nothing and loads nothing but what comes from here, can't
/// be shown within another page nor read by one, and leaves no copy behind.
httplib::Headers PageHeaders();

constexpr const char* kErrorType = "application/json";
/// {"error": words}. `words` are our own.
std::string ErrorBody(const std::string& words);

/// The whole answer to a request that is refused.
std::string RefusalText(const RefusedRequest& refused);

} // namespace ovrin
