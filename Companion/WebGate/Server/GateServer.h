#pragma once

#include "WebGate/RequestCheck.h"
#include "WebGate/Server/Connections.h"
#include "WebGate/Server/ModelPipe.h"
#include "WebGate/Server/OpenPages.h"
#include "WebGate/Server/PeerCheck.h"

#include <atomic>
#include <httplib.h>
#include <optional>
#include <string>
#include <thread>

namespace ovrin {

/// The server of one page on 127.0.0.1: reads each request under its own limits, checks it, and lets the
/// library make of it, from a clean copy, what the model is asked. A connection serves one request.
class GateServer : public httplib::Server {
public:
    GateServer(ModelPipe& model, const std::string& token);

    /// Takes a port, any free one for 0. Returns it; nothing if it can't be had.
    std::optional<int> Bind(int port);
    /// Serves until that is impossible.
    void Serve() { listen_after_bind(); }

private:
    bool process_and_close_socket(socket_t socket) override;
    void ServeRequest(int socket);
    void Answer(int socket, const PassedRequest& passed, const std::string& body);
    void Ask(const httplib::Request& request, httplib::Response& response);
    void KeepOpen(httplib::Response& response);

    ModelPipe& m_Model;
    OpenPages m_Pages;
    PageAddress m_Address;
    std::optional<PeerCheck> m_Peers;
    Connections* m_Connections = nullptr;        // the library's
    std::atomic<std::thread::id> m_LastAnswerer; // who has the answer after which nothing is served
};

} // namespace ovrin
