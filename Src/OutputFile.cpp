#include "OutputFile.h"

#include "FileUtils.h"

#include <fstream>
#include <iostream>

void WriteOutput(const std::string& path, const std::function<void(std::ostream&)>& write) {
    if (path.empty()) {
        write(std::cout);
        std::cout.flush();
        return;
    }
    std::ofstream file(OvrinToNativePath(path), std::ios::binary | std::ios::trunc);
    write(file);
}

void OutputResultToDestination(const std::string& source, const std::string& dest) {
    std::string bytes;
    if (ReadWholeFile(OvrinToNativePath(source), bytes) != ReadResult::Complete) return;
    WriteOutput(dest, [&](std::ostream& stream) {
        stream.write(bytes.data(), static_cast<std::streamsize>(bytes.size()));
    });
}
