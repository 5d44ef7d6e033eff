#pragma once

#include <string>
#include <vector>

namespace ovrin {

class Git;

/// Has git fetch these blobs at once where a partial clone left blobs out; elsewhere nothing is done. Those
/// that aren't fetched here git fetches when they are read, one by one, and says then what is wrong.
void FetchBlobs(const Git& git, const std::vector<std::string>& ids);

} // namespace ovrin
