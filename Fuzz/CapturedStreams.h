#pragma once

#include <algorithm>
#include <iostream>
#include <streambuf>
#include <string>

namespace ovrin_fuzz {

/// Holds back what is printed, as long as it lives. Of the errors the last ones are kept: the program repeats
/// earlier messages ahead of each.
class CapturedStreams {
public:
    CapturedStreams() : m_Cerr(std::cerr.rdbuf(&m_Errors)), m_Cout(std::cout.rdbuf(&m_Output)) {}
    ~CapturedStreams() {
        std::cerr.rdbuf(m_Cerr);
        std::cout.rdbuf(m_Cout);
    }
    CapturedStreams(const CapturedStreams&) = delete;
    CapturedStreams& operator=(const CapturedStreams&) = delete;

    /// The end of what was written to the error stream, and the size of all of it.
    const std::string& LastErrors() const { return m_Errors.end; }
    std::size_t ErrorSize() const { return m_Errors.size; }

private:
    struct Tail final : std::streambuf {
        std::streamsize xsputn(const char* text, std::streamsize count) override {
            constexpr std::streamsize kKept = 8192;
            size += static_cast<std::size_t>(count);
            end.assign(text + std::max(count - kKept, std::streamsize{0}), text + count);
            return count;
        }
        int overflow(int) override { return 0; }

        std::string end;
        std::size_t size = 0;
    };

    Tail m_Errors, m_Output;
    std::streambuf* const m_Cerr;
    std::streambuf* const m_Cout;
};

} // namespace ovrin_fuzz
