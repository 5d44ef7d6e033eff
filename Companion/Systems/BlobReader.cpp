#include "Systems/BlobReader.h"

#include "Words/Failure.h"

#include <algorithm>
#include <charconv>
#include <unistd.h>

namespace ovrin {

BlobReader::~BlobReader() {
    if (!m_Child) return;
    // Without requests it ends; what it still says has nowhere to go.
    m_ToChild.Close();
    m_FromChild.Close();
    WaitForProcess(m_Child);
}

void BlobReader::Start() {
    if (m_Child) return;
    Pipe requests, answers;
    m_Child = StartProcess({"git", "cat-file", "--batch"}, m_Setting,
                           {requests.read.Get(), answers.write.Get(), STDERR_FILENO});
    m_ToChild = std::move(requests.write);
    m_FromChild = std::move(answers.read);
}

void BlobReader::Ask(const std::string& id) {
    const bool isID = !id.empty() && std::ranges::all_of(id, [](char c) {
        return (c >= '0' && c <= '9') || (c >= 'a' && c <= 'f');
    });
    if (!isID) throw Failure("\"" + id + "\" is no id of a blob");
    Start();
    const std::string request = id + "\n";
    if (WriteFully(m_ToChild.Get(), request.data(), request.size()) != 0)
        throw Failure("git ended before it gave the blob " + id);
}

/// Waits for more of the answer.
void BlobReader::Fill() {
    constexpr std::size_t kMost = std::size_t{64} * 1024;
    m_Buffer.resize(kMost);
    m_Taken = 0;
    const ssize_t count = Uninterrupted([&] { return read(m_FromChild.Get(), m_Buffer.data(), kMost); });
    m_Buffer.resize(count > 0 ? static_cast<std::size_t>(count) : 0);
    if (count <= 0) throw Failure("git ended in the middle of a blob");
}

/// Of a line "ID blob SIZE". An object of another type is passed over: the next answer stands behind it.
std::size_t BlobReader::ReadSize(const std::string& id) {
    std::string line;
    do {
        if (m_Taken == m_Buffer.size()) Fill();
        line += m_Buffer[m_Taken++];
    } while (line.back() != '\n');
    line.pop_back();
    std::size_t size = 0;
    const std::size_t at = line.rfind(' ') + 1; // npos + 1 is 0
    const auto [end, error] = std::from_chars(line.data() + at, line.data() + line.size(), size);
    const bool hasSize =
        line.starts_with(id + " ") && error == std::errc() && end == line.data() + line.size();
    const bool isBlob = hasSize && line.substr(0, at) == id + " blob ";
    if (hasSize && !isBlob) {
        Skip(size);
        Skip(1);
    }
    if (!isBlob) throw Failure("git has no blob " + id + ", it says \"" + line + "\"");
    return size;
}

void BlobReader::Append(std::string& bytes, std::size_t count) {
    while (count > 0) {
        if (m_Taken == m_Buffer.size()) Fill();
        const std::size_t now = std::min(count, m_Buffer.size() - m_Taken);
        bytes.append(m_Buffer, m_Taken, now);
        m_Taken += now;
        count -= now;
    }
}

void BlobReader::Skip(std::size_t count) {
    while (count > 0) {
        if (m_Taken == m_Buffer.size()) Fill();
        const std::size_t now = std::min(count, m_Buffer.size() - m_Taken);
        m_Taken += now;
        count -= now;
    }
}

std::optional<std::string> BlobReader::ReadIf(const std::string& id,
                                              const std::function<bool(std::string_view)>& isWanted) {
    Ask(id);
    const std::size_t size = ReadSize(id);
    std::string bytes;
    Append(bytes, std::min(size, kBeginning));
    const bool isTaken = isWanted(bytes);
    if (isTaken) {
        bytes.reserve(size);
        Append(bytes, size - bytes.size());
    } else {
        Skip(size - bytes.size());
    }
    Skip(1); // the line break behind it
    if (!isTaken) return std::nullopt;
    return bytes;
}

} // namespace ovrin
