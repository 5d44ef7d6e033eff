#include "OutputFile.h"

#include "Descriptor.h"
#include "FileUtils.h"

#include <cerrno>
#include <fcntl.h>
#include <iostream>
#include <unistd.h>
#include <utility>

namespace {

Descriptor OpenOutput(const std::string& path) {
    if (!path.empty()) return OpenFile(OvrinToNativePath(path).c_str(), O_WRONLY | O_CREAT | O_TRUNC, 0666);
    std::cout.flush(); // what was printed so far stands before
    return Duplicate(STDOUT_FILENO);
}

} // namespace

int WriteOutput(const std::string& path, const OutputWriter& write) {
    Descriptor file = OpenOutput(path);
    return file.IsOpen() ? WriteAndClose(std::move(file), write) : errno;
}

int WriteAndClose(Descriptor file, const OutputWriter& write) {
    OutputStream stream(file.Get());
    write(stream);
    const int error = stream.Finish();
    const int closeError = file.Close();
    return error ? error : closeError;
}
