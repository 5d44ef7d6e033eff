#include "Systems/ChangedFile.h"

#include "FileUtils.h"
#include "Words/Failure.h"

namespace ovrin {

FileVersion VersionOnDisk(const std::string& path) {
    return [path](const IsWanted& isWanted) -> std::optional<std::string> {
        std::string bytes;
        if (ReadWholeFile(path, bytes) != ReadResult::Complete) throw Failure("Cannot read " + path);
        if (!isWanted(bytes)) return std::nullopt;
        return bytes;
    };
}

} // namespace ovrin
