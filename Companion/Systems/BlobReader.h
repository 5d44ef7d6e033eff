#pragma once

#include "Systems/ChildProcess.h"

#include <functional>
#include <optional>
#include <string>
#include <string_view>

namespace ovrin {

/// Reads blobs of a git repository, one after the other, from one process of git that is started by the
/// first. What a partial clone lacks git fetches. For one thread at a time.
class BlobReader {
public:
    /// `setting` says in which repository: by its folder, or by what it adds to the environment.
    explicit BlobReader(ProcessSetting setting) : m_Setting(std::move(setting)) {}
    BlobReader(const BlobReader&) = delete;
    BlobReader& operator=(const BlobReader&) = delete;
    ~BlobReader();

    /// The bytes of a blob, by its id, which is the way to name any file: the names of files may hold what
    /// the process takes for the end of a request. Throws Failure if the repository has no such blob.
    std::string Read(const std::string& id) {
        return *ReadIf(id, [](std::string_view) { return true; });
    }

    /// The bytes of a blob if isWanted(beginning) tells so of its first kBeginning bytes; nothing, and never
    /// more memory than that, if not.
    static constexpr std::size_t kBeginning = 4096;
    std::optional<std::string> ReadIf(const std::string& id,
                                      const std::function<bool(std::string_view)>& isWanted);

private:
    void Start();
    void Ask(const std::string& id);
    std::size_t ReadSize(const std::string& id);
    void Append(std::string& bytes, std::size_t count);
    void Skip(std::size_t count);
    void Fill();

    const ProcessSetting m_Setting;
    pid_t m_Child = 0; // 0: not started
    Descriptor m_ToChild, m_FromChild;
    std::string m_Buffer;    // what was read and not yet taken
    std::size_t m_Taken = 0; // of the buffer
};

} // namespace ovrin
