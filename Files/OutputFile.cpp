#include "OutputFile.h"

#include "Descriptor.h"
#include "FileUtils.h"

#include <cerrno>
#include <fcntl.h>
#include <iostream>
#include <sys/stat.h>
#include <unistd.h>
#include <utility>

namespace {

Descriptor OpenOutput(const std::string& path) {
    if (!path.empty()) return OpenFile(OvrinToNativePath(path).c_str(), O_WRONLY | O_CREAT, 0666);
    std::cout.flush(); // what was printed so far stands before
    return Duplicate(STDOUT_FILENO);
}

/// One that is empty isn't truncated: some file systems would take it for one that is being replaced, and
/// bring it to the disk at once. Returns errno or 0.
int MakeEmpty(int file) {
    struct stat facts;
    const bool hasContent = fstat(file, &facts) == 0 && S_ISREG(facts.st_mode) && facts.st_size != 0;
    return hasContent ? SetSize(file, 0) : 0;
}

} // namespace

int WriteOutput(const std::string& path, const OutputWriter& write) {
    Descriptor file = OpenOutput(path);
    if (!file.IsOpen()) return errno;
    const int error = path.empty() ? 0 : MakeEmpty(file.Get());
    return error ? error : WriteAndClose(std::move(file), write);
}

int WriteAndClose(Descriptor file, const OutputWriter& write) {
    OutputStream stream(file.Get());
    write(stream);
    const int error = stream.Finish();
    const int closeError = file.Close();
    return error ? error : closeError;
}
