#pragma once

#include "Values/YAMLError.h"

#include <string>

namespace failures {

/// What `act` throws as an `Error`, or "none". Exceptions of other kinds pass.
template <class Error = ovrin_yaml::YAMLError, class Act> std::string ErrorOf(const Act& act) {
    try {
        act();
    } catch (const Error& error) {
        return error.what();
    }
    return "none";
}

} // namespace failures
