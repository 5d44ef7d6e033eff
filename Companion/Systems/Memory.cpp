#include "Systems/Memory.h"

#include "FileUtils.h"

#include <algorithm>
#include <cstdlib>
#include <string>
#include <unistd.h>

namespace ovrin {

std::uint64_t UsableMemory() {
    std::uint64_t memory = static_cast<std::uint64_t>(sysconf(_SC_PHYS_PAGES)) *
                           static_cast<std::uint64_t>(sysconf(_SC_PAGESIZE));
    // Of the container, in the second and the first form of control groups; "max" is no number.
    for (const char* file : {"/sys/fs/cgroup/memory.max", "/sys/fs/cgroup/memory/memory.limit_in_bytes"}) {
        std::string text;
        if (ReadWholeFile(file, text) != ReadResult::Complete) continue;
        if (const std::uint64_t limit = std::strtoull(text.c_str(), nullptr, 10))
            memory = std::min(memory, limit);
    }
    return memory;
}

} // namespace ovrin
