#pragma once

#include "Descriptor.h"
#include "Systems/WorkerProcesses.h"
#include "WebGate/WebFrame.h"

#include <optional>
#include <string>
#include <sys/types.h>

namespace ovrin {

/// The program "ovrin-web" at work for this one.
class Gate {
public:
    /// Starts it. Throws Failure where it isn't installed, and for a port that can't be had; 0 is any.
    explicit Gate(int port);
    Gate(const Gate&) = delete;
    Gate& operator=(const Gate&) = delete;
    /// Ends it.
    ~Gate() = default;

    /// Of the page; whoever knows it may use it.
    const std::string& Address() const { return m_Address; }
    int Socket() const { return m_Socket.Get(); }
    /// The next frame, once Socket can be read. Throws Failure if the program came to its end.
    WebFrame Receive();
    void Send(const WebFrame& frame);
    /// Waits, not for long, until the program has ended by itself after the last answer.
    void AwaitEnd() const;

private:
    /// It holds nothing that could be lost.
    struct Child {
        pid_t process = 0;
        ~Child();
    };

    void Begin(int port, const std::string& token);
    [[noreturn]] void TellEnd();

    Child m_Child;
    Descriptor m_Socket;
    std::optional<ClosedInCopies> m_ClosedInCopies;
    std::string m_Address;
};

} // namespace ovrin
