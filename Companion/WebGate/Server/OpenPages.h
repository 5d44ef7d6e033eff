#pragma once

#include "WebGate/Server/ModelPipe.h"

#include <cstddef>
#include <mutex>

namespace ovrin {

/// Counts the pages that are open, each of which keeps an event stream, and tells the model.
class OpenPages {
public:
    explicit OpenPages(ModelPipe& model) : m_Model(model) {}

    /// False if there are as many as may be; then nothing is counted.
    bool Enter();
    void Leave();

private:
    ModelPipe& m_Model;
    std::mutex m_Mutex; // the model hears of changes in their order
    std::size_t m_Count = 0;
};

} // namespace ovrin
