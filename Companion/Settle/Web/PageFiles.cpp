#include "Settle/Web/PageFiles.h"

#include <algorithm>

namespace ovrin {

std::optional<PageAnswer> AnswerPageFile(const PageRequest& request) {
    const std::string_view name = request.path.empty() ? "index.html" : std::string_view(request.path);
    const std::span<const PageFile> files = PageFiles();
    const auto file = std::ranges::find(files, name, &PageFile::name);
    if (file == files.end() || request.method != "GET") return std::nullopt;
    return PageAnswer{200, std::string(file->type), std::string(file->bytes)};
}

} // namespace ovrin
