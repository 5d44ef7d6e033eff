#include "Settle/Web/PageServer.h"

#include "Settle/Web/Browser.h"
#include "Settle/Web/EndSignals.h"
#include "Settle/Web/Gate.h"
#include "Values/YAMLError.h"
#include "Words/Failure.h"

#include <algorithm>
#include <array>
#include <chrono>
#include <exception>
#include <iostream>
#include <optional>
#include <poll.h>

namespace ovrin {

namespace {

using Clock = std::chrono::steady_clock;
using AnswerPage = std::function<PageAnswer(const PageRequest&)>;

/// What a page that is loaded anew has to come back.
constexpr std::chrono::seconds kTimeWithoutPage{10};
/// Bytes of an answer; the frame has more around it.
constexpr std::size_t kMostAnswer = kMostAnswerFrame - 4096;
/// How often a browser that was started is looked after.
constexpr std::chrono::milliseconds kBrowserStep{500};

PageRequest RequestOf(const WebFrame& frame) {
    PageRequest request{frame.at(1), frame.at(2), {}, frame.at(3)};
    for (std::size_t i = 4; i + 1 < frame.size(); i += 2) request.query.emplace(frame[i], frame[i + 1]);
    return request;
}

PageAnswer AnswerSafely(const AnswerPage& answer, const PageRequest& request) {
    try {
        PageAnswer given = answer(request);
        // The program that serves the page takes no longer ones, and would end with it.
        if (given.body.size() > kMostAnswer)
            return PageError(507, "The scene has texts here that are too long for a page");
        return given;
    } catch (const Failure& failure) {
        return PageError(400, failure.what());
    } catch (const std::exception& error) {
        return PageError(500, error.what());
    } catch (const ovrin_yaml::YAMLError& error) {
        return PageError(500, error.what());
    }
}

/// One serving of pages, from the browser's start to the end.
class Serving {
public:
    Serving(Gate& gate, const PageOptions& options, const AnswerPage& answer)
        : m_Gate(gate), m_Answer(answer) {
        std::cerr << "The page stands at " << gate.Address() << "\nCtrl-C ends it.\n";
        if (options.opensBrowser) m_Browser.emplace(gate.Address());
    }

    PageEnd Run(const EndSignals& signals) {
        for (;;) {
            if (const auto problem = m_Browser ? m_Browser->Problem() : std::nullopt)
                std::cerr << "ovrin: " << *problem << ": open the address yourself.\n";
            std::array<pollfd, 2> ends = {{{m_Gate.Socket(), POLLIN, 0}, {signals.File(), POLLIN, 0}}};
            if (poll(ends.data(), ends.size(), Timeout()) < 0) continue; // a signal
            if (ends[1].revents) return PageEnd::Stopped;
            if (ends[0].revents) {
                if (Take(m_Gate.Receive())) return PageEnd::Over;
            } else if (m_Left && Clock::now() >= *m_Left + kTimeWithoutPage) {
                return PageEnd::Closed;
            }
        }
    }

private:
    /// Milliseconds to wait for whatever comes; -1 for no end.
    int Timeout() const {
        if (m_Browser && m_Browser->IsPending()) return static_cast<int>(kBrowserStep.count());
        if (!m_Left) return -1;
        const auto left =
            std::chrono::ceil<std::chrono::milliseconds>(*m_Left + kTimeWithoutPage - Clock::now());
        return static_cast<int>(std::max<std::chrono::milliseconds::rep>(left.count(), 0));
    }

    /// True if it was the last.
    bool Take(const WebFrame& frame) {
        if (frame[0] == "pages") {
            m_Left = frame.at(1) == "0" ? std::optional(Clock::now()) : std::nullopt;
            return false;
        }
        const PageAnswer answer = AnswerSafely(m_Answer, RequestOf(frame));
        m_Gate.Send(
            {"answer", std::to_string(answer.status), answer.type, answer.body, answer.isOver ? "over" : ""});
        if (answer.isOver) m_Gate.AwaitEnd();
        return answer.isOver;
    }

    Gate& m_Gate;
    const AnswerPage& m_Answer;
    std::optional<Browser> m_Browser;
    std::optional<Clock::time_point> m_Left; // when the last page was closed
};

} // namespace

PageEnd ServePages(const PageOptions& options, const AnswerPage& answer) {
    Gate gate(options.port);
    const EndSignals signals;
    return Serving(gate, options, answer).Run(signals);
}

} // namespace ovrin
