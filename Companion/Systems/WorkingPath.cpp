#include "Systems/WorkingPath.h"

#include "Systems/Repository.h"
#include "Words/Failure.h"

#include <filesystem>

namespace ovrin {

namespace fs = std::filesystem;

std::string WorkingPath(const Repository& repository, const std::string& given) {
    std::error_code error;
    fs::path absolute = fs::absolute(given, error).lexically_normal();
    if (!absolute.has_filename()) absolute = absolute.parent_path(); // ended in a separator
    // The file itself may be a link, which version control knows by its own name.
    const fs::path folder = fs::weakly_canonical(absolute.parent_path(), error);
    const fs::path path = (folder / absolute.filename()).lexically_relative(repository.top);
    if (repository.top.empty() || path.empty() || *path.begin() == "..")
        throw Failure(given + " is outside of the working tree " + repository.top);
    return path.string();
}

bool IsAtOrBelow(const std::string& path, const std::string& place) {
    return place == "." || path == place || path.starts_with(place + "/");
}

} // namespace ovrin
