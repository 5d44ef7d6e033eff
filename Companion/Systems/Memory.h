#pragma once

#include <cstdint>

namespace ovrin {

/// The memory that this process may have, in bytes: that of the machine, or of the container that it runs in.
std::uint64_t UsableMemory();

} // namespace ovrin
