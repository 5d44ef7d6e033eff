#include "Systems/Process.h"

#include "Systems/ChildProcess.h"
#include "Words/Failure.h"

#include <array>
#include <cerrno>
#include <cstdlib>
#include <fcntl.h>
#include <poll.h>
#include <sstream>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

/// Writes `input` and reads both outputs, as they come, until all are closed.
void Talk(Descriptor& toChild, std::string_view input, Descriptor& output, ProcessResult& result,
          Descriptor& errors) {
    if (input.empty()) toChild.Close();
    if (toChild.IsOpen()) fcntl(toChild.Get(), F_SETFL, O_NONBLOCK);
    char buffer[std::size_t{64} * 1024];
    const auto take = [&](Descriptor& from, std::string& into) {
        const ssize_t count = Uninterrupted([&] { return read(from.Get(), buffer, sizeof(buffer)); });
        if (count > 0)
            into.append(buffer, static_cast<std::size_t>(count));
        else
            from.Close();
    };
    while (toChild.IsOpen() || output.IsOpen() || errors.IsOpen()) {
        std::array<pollfd, 3> ends = {{{toChild.IsOpen() ? toChild.Get() : -1, POLLOUT, 0},
                                       {output.IsOpen() ? output.Get() : -1, POLLIN, 0},
                                       {errors.IsOpen() ? errors.Get() : -1, POLLIN, 0}}};
        if (poll(ends.data(), ends.size(), -1) < 0) continue; // a signal
        if (ends[0].revents) {
            const ssize_t count = write(toChild.Get(), input.data(), input.size());
            if (count > 0) input.remove_prefix(static_cast<std::size_t>(count));
            if (input.empty() || (count < 0 && errno != EAGAIN && errno != EINTR)) toChild.Close();
        }
        if (ends[1].revents) take(output, result.output);
        if (ends[2].revents) take(errors, result.errors);
    }
}

[[noreturn]] void Fail(const CommandWords& command, const ProcessResult& result) {
    std::string words;
    for (const std::string& word : command) words += (words.empty() ? "" : " ") + word;
    throw Failure("\"" + words + "\" failed with status " + std::to_string(result.status) +
                  (result.errors.empty() ? "" : ":\n" + result.errors));
}

} // namespace

ProcessResult RunProcess(const CommandWords& command, const ProcessSetting& setting) {
    Pipe input, output, errors;
    const pid_t child = StartProcess(
        command, setting,
        {input.read.Get(), output.write.Get(), setting.showErrors ? STDERR_FILENO : errors.write.Get()});
    for (Descriptor* end : {&input.read, &output.write, &errors.write}) end->Close();
    ProcessResult result{};
    Talk(input.write, setting.input, output.read, result, errors.read);
    result.status = WaitForProcess(child);
    return result;
}

std::string OutputOf(const CommandWords& command, const ProcessSetting& setting) {
    ProcessResult result = RunProcess(command, setting);
    if (!result.Succeeded()) Fail(command, result);
    return std::move(result.output);
}

std::string AnswerOf(const CommandWords& command, const ProcessSetting& setting) {
    constexpr int kNone = 1;
    ProcessResult result = RunProcess(command, setting);
    if (result.status == kNone) return {};
    if (!result.Succeeded()) Fail(command, result);
    return WithoutLineEnd(std::move(result.output));
}

std::string WithoutLineEnd(std::string text) {
    if (text.ends_with('\n')) text.pop_back();
    return text;
}

std::vector<std::string> ZeroEndedTexts(std::string_view listed) {
    std::vector<std::string> texts;
    for (std::size_t end; (end = listed.find('\0')) != std::string_view::npos; listed.remove_prefix(end + 1))
        texts.emplace_back(listed.substr(0, end));
    return texts;
}

std::string FindProgram(const std::string& name) {
    const char* path = std::getenv("PATH");
    std::istringstream folders(path ? path : "/usr/bin:/bin");
    for (std::string folder; std::getline(folders, folder, ':');) {
        std::string place = (folder.empty() ? "." : folder) + "/" + name;
        if (access(place.c_str(), X_OK) == 0) return place;
    }
    return {};
}

} // namespace ovrin
