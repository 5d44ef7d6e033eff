#pragma once

#include "Descriptor.h"

#include <functional>
#include <string>
#include <sys/types.h>
#include <vector>

namespace ovrin {

/// A copy of this process that holds a scene and answers for it: what the engine takes of memory goes with
/// it, and so does whatever ends it. Only for a process without other threads.
class SceneProcess {
public:
    /// What it is asked, and what it answers: texts of any bytes.
    using Texts = std::vector<std::string>;
    using Answer = std::function<Texts(const Texts&)>;

    /// Calls `open` there, at once, and what it returns for each question from then on. Throws Failure if no
    /// process can be started.
    explicit SceneProcess(const std::function<Answer()>& open);
    SceneProcess(const SceneProcess&) = delete;
    SceneProcess& operator=(const SceneProcess&) = delete;
    /// Ends it.
    ~SceneProcess();

    /// Throws Failure if the process came to its end.
    Texts Ask(const Texts& question);

private:
    Descriptor m_Socket;
    pid_t m_Process = 0;
};

} // namespace ovrin
