#include "WebGate/Server/ModelPipe.h"

#include <utility>

namespace ovrin {

void ModelPipe::Tell(const WebFrame& frame) {
    const std::lock_guard sending(m_Sending);
    SendFrame(m_Socket, frame); // that nobody reads it is found out by TakeAnswers
}

WebFrame ModelPipe::Ask(const WebFrame& request) {
    const std::lock_guard turn(m_Turn);
    {
        const std::lock_guard answered(m_Answered);
        m_IsAwaited = true;
    }
    Tell(request);
    std::unique_lock answered(m_Answered);
    m_HasAnswer.wait(answered, [&] { return m_Answer.has_value(); });
    return *std::exchange(m_Answer, std::nullopt);
}

void ModelPipe::TakeAnswers() {
    for (;;) {
        std::optional<WebFrame> frame = ReceiveFrame(m_Socket, kMostAnswerFrame);
        if (!frame || frame->size() != 5 || frame->front() != "answer") return;
        const std::lock_guard answered(m_Answered);
        if (!std::exchange(m_IsAwaited, false)) return; // to no question: the next one would get it
        m_Answer = std::move(frame);
        m_HasAnswer.notify_one();
    }
}

} // namespace ovrin
