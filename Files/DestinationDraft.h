#pragma once

#include "NewFile.h"

#include <condition_variable>
#include <cstdint>
#include <memory>
#include <mutex>
#include <string>
#include <thread>

/// A copy of a result beside its destination, made while the result is still being written, so that little is
/// left to do when it is delivered. It has no name until then, and vanishes with the process.
///
///     result        |=================>          |  written by one thread
///     draft         |=============>              |  copied by another, behind it
///     destination   |    as it was               |  replaced by the draft, or by a new copy
///
/// Only big results for a destination that is a regular file get one. Whatever goes wrong with it is no
/// failure: it is given up, and the result is delivered without it.
class DestinationDraft {
public:
    static constexpr std::uint64_t kMuch = std::uint64_t{4} << 20;

    /// `dest` as for Deliver. Nothing is made ahead of `much` bytes.
    explicit DestinationDraft(const std::string& dest, std::uint64_t much = kMuch)
        : m_Dest(dest), m_Much(much), m_MayBegin(!dest.empty()) {}
    DestinationDraft(const DestinationDraft&) = delete;
    DestinationDraft& operator=(const DestinationDraft&) = delete;
    ~DestinationDraft();

    /// Tells that the first `length` bytes of the file `source` are written and will stay. `length` grows
    /// from call to call, and the file is always the same.
    void Follow(const std::string& source, std::uint64_t length) noexcept;
    /// Gives the draft and its space back. Returns whether there was one.
    bool GiveUp();
    /// Copies the rest. Returns whether the draft is the whole of `source`, an open file, now; otherwise it
    /// is given up.
    bool Complete(const Descriptor& source);
    /// Puts a complete draft in the place of `old`, which stands at `place`. False if that can't be done; it
    /// is given up then, and `old` stands where it was.
    bool TakePlace(const std::string& place, const Descriptor& old, Durability durability);

private:
    void Begin(const std::string& source);
    int Fill(NewFile& target) noexcept;
    void Copy(OutputStream& stream);
    std::uint64_t WaitBehind(std::uint64_t position);
    void End(std::uint64_t length);

    const std::string m_Dest;
    const std::uint64_t m_Much;
    bool m_MayBegin;
    std::string m_Place; // where the links of m_Dest lead
    Descriptor m_Source;
    std::unique_ptr<NewFile> m_File; // null: there is none, or none any more

    std::mutex m_Lock;
    std::condition_variable m_Changed;
    std::uint64_t m_Length = 0; // of the source, as far as it is written
    bool m_HasEnded = false;    // nothing will be behind that
    int m_Error = 0;            // of the thread
    std::jthread m_Thread;
};
