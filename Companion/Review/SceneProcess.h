#pragma once

#include "Review/PageRequest.h"

#include "Descriptor.h"

#include <functional>
#include <sys/types.h>

namespace ovrin {

/// A copy of this process that holds a scene and answers for it: what the engine takes of memory goes with
/// it, and so does whatever ends it. Only for a process without other threads.
class SceneProcess {
public:
    using Answer = std::function<PageAnswer(const PageRequest&)>;

    /// Calls `open` there, and what it returns for each request from then on. Where it throws Failure, that
    /// is the answer to all of them. Throws Failure if no process can be started.
    explicit SceneProcess(const std::function<Answer()>& open);
    SceneProcess(const SceneProcess&) = delete;
    SceneProcess& operator=(const SceneProcess&) = delete;
    /// Ends it.
    ~SceneProcess();

    /// Throws Failure if the process came to its end.
    PageAnswer Ask(const PageRequest& request);

private:
    Descriptor m_Socket;
    pid_t m_Process = 0;
};

} // namespace ovrin
