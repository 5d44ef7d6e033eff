#pragma once

#include "WebGate/WebFrame.h"

#include <condition_variable>
#include <cstddef>
#include <mutex>
#include <optional>

namespace ovrin {

/// The way to the model, which answers one request at a time. For many threads.
class ModelPipe {
public:
    /// `socket` stays open.
    explicit ModelPipe(int socket) : m_Socket(socket) {}

    /// Sends a frame that has no answer.
    void Tell(const WebFrame& frame);
    /// Sends a request when it is its turn, and waits for its answer.
    WebFrame Ask(const WebFrame& request);
    /// Takes the answers. Returns when the model has ended, or sends what is none; whoever waits for an
    /// answer then waits on.
    void TakeAnswers();

private:
    const int m_Socket;
    std::mutex m_Turn;    // of those who ask
    std::mutex m_Sending; // keeps frames in one piece
    std::mutex m_Answered;
    std::condition_variable m_HasAnswer;
    bool m_IsAwaited = false; // an answer
    std::optional<WebFrame> m_Answer;
};

} // namespace ovrin
