#pragma once

#include <string>
#include <sys/stat.h>

/// Whether two files that were looked at are one.
inline bool IsSameFile(const struct stat& left, const struct stat& right) {
    return left.st_dev == right.st_dev && left.st_ino == right.st_ino;
}

/// Replaces `path` by what its links lead to, which need not exist. Returns errno or 0; EPERM for what was
/// named by its number as an open file, and must keep its identity.
int FollowLinks(std::string& path);
