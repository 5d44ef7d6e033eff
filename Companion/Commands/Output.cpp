#include "Commands/Output.h"

#include "Descriptor.h"
#include "OutputFile.h"
#include "Words/Failure.h"
#include "Words/WriteFailure.h"

#include <cerrno>
#include <unistd.h>

namespace ovrin {

void PrintResult(std::string_view text) {
    const int error = WriteOutput({}, [&](OutputStream& stream) { stream << text; });
    if (error && error != EPIPE) throw Failure("Cannot write to standard output: " + WhyNotWritten(error));
}

void Tell(std::string_view text) {
    // Where it can't be said there is nobody left to tell that to.
    WriteFully(STDERR_FILENO, text.data(), text.size());
}

} // namespace ovrin
