#include "ErrMsg.h"

#include <iostream>
#include <mutex>

namespace {

std::mutex s_cerrLock;

} // namespace

void ErrMsg(std::stringstream& message) {
    const std::lock_guard lock(s_cerrLock);
    std::cerr << message.str();
    message.clear();
}
