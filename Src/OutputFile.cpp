#include "OutputFile.h"

#include "FileUtils.h"

#include <fstream>
#include <iostream>
#include <vector>

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
    std::filebuf input;
    if (!input.open(OvrinToNativePath(source), std::ios::in | std::ios::binary)) return;
    WriteOutput(dest, [&](std::ostream& stream) {
        std::vector<char> piece(std::size_t{1} << 20);
        for (;;) {
            const std::streamsize count =
                input.sgetn(piece.data(), static_cast<std::streamsize>(piece.size()));
            if (count <= 0) break;
            stream.write(piece.data(), count);
        }
    });
}
