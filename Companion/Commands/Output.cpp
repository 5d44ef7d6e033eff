#include "Commands/Output.h"

#include "OutputFile.h"
#include "Words/Failure.h"

#include <cerrno>
#include <system_error>

namespace ovrin {

void PrintResult(std::string_view text) {
    const int error = WriteOutput({}, [&](OutputStream& stream) { stream << text; });
    if (error && error != EPIPE)
        throw Failure("Cannot write to standard output: " + std::system_category().message(error));
}

} // namespace ovrin
