#pragma once

#include "Settle/Terminal/ConflictList.h"
#include "Settle/Terminal/KeyTable.h"
#include "Settle/Terminal/StyledText.h"

#include <memory>
#include <vector>

namespace ovrin {

/// The terminal of this process, full of lines, as long as the object lives; there is one at most. Whatever
/// ends the object, or the process by Ctrl-C, SIGTERM, SIGHUP or SIGQUIT, leaves the terminal as it was.
class Curses {
public:
    /// Null for a terminal that can't be addressed, or of which the machine knows nothing. The locale must be
    /// set. `words` are left behind by an end through a signal.
    static std::unique_ptr<Curses> Open(const char* words);
    Curses(const Curses&) = delete;
    Curses& operator=(const Curses&) = delete;
    ~Curses();

    Extent Size() const;
    void Show(const std::vector<StyledLine>& picture);
    /// Waits for a key. Nothing once the terminal is gone.
    std::optional<Key> Read();

private:
    Curses();
};

} // namespace ovrin
