#pragma once

namespace ovrin {

/// Tells whose program is at the other end of a connection: an address is not secret enough on a machine with
/// several users, who see each other's command lines, that of a browser with it.
class PeerCheck {
public:
    /// Finds out whether this system tells. `port` is listened to.
    explicit PeerCheck(int port);

    /// Whether the other end belongs to the user of this process or to root, which relays for others; also
    /// where the system doesn't tell, and for root.
    bool IsOurs(int socket) const;

private:
    bool m_Works = false;
};

} // namespace ovrin
