#include "WebGate/Server/GateServer.h"
#include "WebGate/Server/ModelPipe.h"

#include <cstdlib>
#include <iostream>
#include <sys/socket.h>
#include <thread>
#include <unistd.h>

namespace {

using namespace ovrin;

/// Standard input is the socket that leads to the model, which tells there what to serve: arguments can be
/// read by other users.
int Run(int socket) {
    const std::optional<WebFrame> order = ReceiveFrame(socket, kMostRequestFrame);
    if (!order || order->size() != 3 || order->front() != "serve") return EXIT_FAILURE;
    ModelPipe model(socket);
    GateServer server(model, (*order)[1]);
    const std::optional<int> port = server.Bind(std::atoi((*order)[2].c_str()));
    if (!port) {
        model.Tell({"failed", "port " + (*order)[2] + " of 127.0.0.1 can't be had"});
        return EXIT_FAILURE;
    }
    model.Tell({"serving", std::to_string(*port)});
    std::thread([&] {
        server.Serve();
        _exit(EXIT_FAILURE); // no connection can be taken any more
    }).detach();
    model.TakeAnswers();
    // Threads that still wait for something go with the process.
    _exit(EXIT_SUCCESS);
}

} // namespace

int main() {
    int type = 0;
    socklen_t size = sizeof(type);
    if (getsockopt(STDIN_FILENO, SOL_SOCKET, SO_TYPE, &type, &size) != 0) {
        std::cerr
            << "ovrin-web serves the pages of \"ovrin settle --web\" and \"ovrin review\", which start it\n";
        return EXIT_FAILURE;
    }
    return Run(STDIN_FILENO);
}
