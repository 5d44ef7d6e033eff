#pragma once

#include "OutputFile.h"

#include <cstdint>
#include <string>

class DestinationDraft;

/// What a destination is to hold. `write` may be called twice.
struct Content {
    std::uint64_t size = 0;
    OutputWriter write;
    Durability durability = Durability::Synced;
    DestinationDraft* draft = nullptr; // where there is one, it is complete
};

/// Brings `content` to the user's destination, or to standard output where the path is empty. Returns 0 when
/// it is there to its last byte; otherwise the errno, with the destination as it was and nothing beside it.
///
/// A file is replaced as a whole by one of the same mode, access list and, where that is permitted, owner: at
/// every moment the old or the new one stands there. Links are followed. Written in place is what can't be
/// replaced: pipes and devices, the file behind standard output or named as /dev/fd/N, a file of several
/// names, and one in a folder that refuses. Such a file gets its space first, and its old bytes back after a
/// failure.
int Deliver(const std::string& path, const Content& content);

/// Delivers the file `source`, by way of `draft` where that has followed it.
int OutputResultToDestination(const std::string& source, const std::string& dest,
                              DestinationDraft* draft = nullptr);
