#include "WebGate/Server/GateServer.h"

#include "Descriptor.h"
#include "WebGate/Server/CheckedStream.h"
#include "WebGate/Server/PageHeaders.h"
#include "WebGate/Server/RequestReader.h"

#include <chrono>
#include <cstdlib>
#include <sys/socket.h>
#include <thread>
#include <unistd.h>
#include <utility>
#include <variant>

namespace ovrin {

namespace {

constexpr std::size_t kMostConnections = 64;
constexpr const char* kAlivePath = "api/alive";
constexpr const char* kLoopback = "127.0.0.1";
constexpr std::chrono::milliseconds kAliveStep{200};
constexpr int kAliveStepsPerSign = 50;

/// The socket may be taken again at once after an earlier program, but never shared with a living one.
void SetOptions(socket_t socket) {
    const int yes = 1;
    setsockopt(socket, SOL_SOCKET, SO_REUSEADDR, &yes, sizeof(yes));
}

void Refuse(int socket, const RefusedRequest& refused) {
    const std::string text = RefusalText(refused);
    CheckedStream(socket, "").write(text.data(), text.size());
}

} // namespace

GateServer::GateServer(ModelPipe& model, const std::string& token)
    : m_Model(model), m_Pages(model), m_Address{token, 0} {
    new_task_queue = [this] { return m_Connections = new Connections(kMostConnections); };
    set_socket_options(SetOptions);
    set_default_headers(PageHeaders());
    set_payload_max_length(kMostBody);
    const auto ask = [this](const httplib::Request& request, httplib::Response& response) {
        Ask(request, response);
    };
    Get("/.*", ask);
    Post("/.*", ask);
}

std::optional<int> GateServer::Bind(int port) {
    const int bound = port == 0 ? bind_to_any_port(kLoopback) : bind_to_port(kLoopback, port) ? port : -1;
    // The library lets five connections wait, and a browser that is one too many tries again after a second.
    if (bound <= 0 || ::listen(svr_sock_, SOMAXCONN) != 0) return {};
    m_Peers.emplace(bound);
    return m_Address.port = bound;
}

bool GateServer::process_and_close_socket(socket_t socket) {
    const Descriptor closed(socket);
    ServeRequest(socket);
    {
        const Connections::Awaiting awaiting(*m_Connections, socket); // nothing that would be missed
        FinishSending(socket);
    }
    if (m_LastAnswerer == std::this_thread::get_id()) _exit(EXIT_SUCCESS); // the page has its last answer
    return true;
}

void GateServer::ServeRequest(int socket) {
    RequestReader reader(socket);
    std::optional<std::string> head, body;
    std::variant<PassedRequest, RefusedRequest> checked;
    {
        const Connections::Awaiting awaiting(*m_Connections, socket);
        head = reader.Head();
        if (!head) return;
        const std::optional<RequestHead> parsed = ParseRequestHead(*head);
        checked = parsed ? CheckRequest(*parsed, m_Address) : RefusedRequest{400, "This is no request"};
        if (std::holds_alternative<PassedRequest>(checked) && !m_Peers->IsOurs(socket))
            checked = RefusedRequest{403, "The page is another user's"};
        if (const auto* passed = std::get_if<PassedRequest>(&checked)) body = reader.Body(passed->bodyLength);
    }
    if (const auto* refused = std::get_if<RefusedRequest>(&checked)) return Refuse(socket, *refused);
    if (body) Answer(socket, std::get<PassedRequest>(checked), *body);
}

/// Lets the library answer: what it reads is the method and the body, the rest is as the check read it.
void GateServer::Answer(int socket, const PassedRequest& passed, const std::string& body) {
    CheckedStream stream(socket, passed.method + " / HTTP/1.1\r\nContent-Length: " +
                                     std::to_string(body.size()) + "\r\n\r\n" + body);
    bool isClosed = false;
    process_request(stream, true, isClosed, [&](httplib::Request& request) {
        request.path = "/" + passed.path;
        request.params = {passed.query.begin(), passed.query.end()};
    });
}

void GateServer::Ask(const httplib::Request& request, httplib::Response& response) {
    const std::string path = request.path.substr(1);
    if (path == kAlivePath) return KeepOpen(response);
    // What is asked for with HEAD has the same answer, of which the library sends no body.
    WebFrame frame = {"request", request.method == "POST" ? "POST" : "GET", path, request.body};
    for (const auto& [name, value] : request.params) frame.insert(frame.end(), {name, value});
    const WebFrame answer = m_Model.Ask(frame);
    response.status = std::atoi(answer[1].c_str());
    response.set_content(answer[3], answer[2]);
    if (!answer[4].empty()) m_LastAnswerer = std::this_thread::get_id();
}

/// An event stream, on which nothing but a sign of life is ever sent.
void GateServer::KeepOpen(httplib::Response& response) {
    if (!m_Pages.Enter()) {
        response.status = 503;
        response.set_content(ErrorBody("This is open in too many pages: close some"), kErrorType);
        return;
    }
    const auto stayOpen = [step = 0](std::size_t, httplib::DataSink& sink) mutable {
        if (step++ % kAliveStepsPerSign == 0 && !sink.write(":\n\n", 3)) return false;
        std::this_thread::sleep_for(kAliveStep);
        return sink.is_writable();
    };
    response.set_content_provider("text/event-stream", stayOpen, [this](bool) { m_Pages.Leave(); });
}

} // namespace ovrin
