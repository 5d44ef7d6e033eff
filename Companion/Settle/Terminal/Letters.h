#pragma once

#include <cstddef>
#include <string>
#include <string_view>

namespace ovrin {

/// What can be shown where a person sits: the characters of the locale, and how wide they are.
class Letters {
public:
    /// Those of the environment, which this makes the locale of the process for characters. Where the machine
    /// lacks a locale of UTF-8 that is asked for, the one that every machine has stands for it.
    static Letters OfEnvironment();
    /// `isUTF8` only in a process whose locale has UTF-8.
    explicit Letters(bool isUTF8) : m_IsUTF8(isUTF8) {}

    bool IsUTF8() const { return m_IsUTF8; }
    /// Any text as it may stand in a line: printable (Names/PrintableText.h), and what the locale lacks, has
    /// no width that is known or couldn't be seen stands in ASCII or as an escape.
    std::string Shown(std::string_view text) const;

private:
    const bool m_IsUTF8;
};

/// The columns that a shown text takes in a terminal. Combining marks take none, wide characters two.
std::size_t ColumnsOf(std::string_view shown);

/// The bytes of the first characters of a shown text that take at most so many columns, with the marks on the
/// last of them.
std::size_t BytesWithin(std::string_view shown, std::size_t columns);

/// The bytes of the first character of a shown text that isn't empty.
std::size_t FirstCharacterBytes(std::string_view shown);

/// The end of a shown text in at most so many columns, with a mark for what is left out ahead of it.
std::string EndWithin(const std::string& shown, std::size_t columns, const Letters& letters);
/// Its beginning, with the mark behind.
std::string BeginningWithin(const std::string& shown, std::size_t columns, const Letters& letters);

} // namespace ovrin
