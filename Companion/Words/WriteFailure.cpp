#include "Words/WriteFailure.h"

#include <cerrno>
#include <system_error>

namespace ovrin {

std::string WhyNotWritten(int error) {
    const std::string reason = std::system_category().message(error);
    return error == ENOSPC || error == EDQUOT ? reason + ": make room there, and try again" : reason;
}

} // namespace ovrin
