#pragma once

#include "Conflicts/OpenMerge.h"

#include <cstddef>
#include <cstdint>
#include <string>
#include <variant>

namespace ovrin {

/// A side for one item of the list.
struct TakeItem {
    std::size_t item;
    Side side;
};
/// A side for what stands under the object of an item.
struct TakeBelow {
    std::size_t under;
    Side side;
};
/// A side for all that is open.
struct TakeRest {
    Side side;
};
/// What is proposed, wherever something is.
struct TakeProposals {};
/// A remedy of a problem.
struct TakeRemedy {
    std::size_t problem, remedy;
};

/// A step that a page asks for.
struct PageStep {
    std::uint64_t revision; ///< what the page shows
    std::variant<TakeItem, TakeBelow, TakeRest, TakeProposals, TakeRemedy> step;
};

/// What a page asks for at the end.
struct PageFinish {
    std::uint64_t revision;
    bool overwrite;
};

/// The body of api/take: {"item": 3, "side": "ours", "revision": 7}, {"under": 3, "side", "revision"},
/// {"all": true, "side", "revision"}, {"proposed": true, "revision"} or {"problem": 0, "remedy": 1,
/// "revision"}. These throw Failure for anything else: what nobody understands in full isn't done by half.
PageStep ReadStep(const std::string& body);
/// The body of api/undo and api/redo: {"revision": 7}.
std::uint64_t ReadRevision(const std::string& body);
/// The body of api/finish: {"overwrite": false, "revision": 7}.
PageFinish ReadFinish(const std::string& body);
/// The body of api/leave: {}.
void ReadNothing(const std::string& body);

} // namespace ovrin
