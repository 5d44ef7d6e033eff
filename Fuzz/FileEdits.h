#pragma once

#include <cstddef>
#include <random>
#include <span>
#include <string>
#include <string_view>

namespace ovrin_fuzz {

/// Edits of object files as people and faults make them, line by line: what plain changes of bytes hardly
/// ever come upon. One edit meets the same line in every file that it is made in, so that the files stay
/// versions of each other.
class FileEdits {
public:
    explicit FileEdits(unsigned seed) : m_Random(seed) {}

    /// Makes one edit in some of the files, or in all.
    void Edit(std::span<std::string> files);

private:
    std::size_t Below(std::size_t limit) { return m_Random() % limit; }
    template <std::size_t count> std::string_view OneOf(const std::string_view (&texts)[count]) {
        return texts[Below(count)];
    }
    std::string Key();
    std::string Value();
    void EditLines(std::span<std::string> files);
    void PutInTwins(std::span<std::string> files, std::string_view line);
    void ShareObject(std::span<std::string> files);
    void EditFrame(std::string& file);

    std::mt19937 m_Random;
};

} // namespace ovrin_fuzz
