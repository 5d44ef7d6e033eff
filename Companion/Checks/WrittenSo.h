#pragma once

#include "Reading/Fast/BatchedBuilder.h"
#include "Reading/Fast/WrittenFormReader.h"

#include <optional>
#include <string>
#include <string_view>

namespace ovrin {

/// Whether an object would be written as the bytes of its document; one that repeats a key at its top can't
/// be written at all, which is no question of form.
bool IsWrittenSo(const ovrin_yaml::YAMLScalar& id, const ovrin_yaml::YAMLMapping& object,
                 std::string_view document);

/// Finds the first document of a row that isn't in the form that is written. The fast reader is sure of most
/// that are; of those that it isn't sure of, such as those with escapes, trees are made and written again.
class FormSearch {
public:
    /// Of documents in `text`, which must stay.
    explicit FormSearch(std::string_view text) : m_Text(text) {}

    /// Whether this is the one; never again after it was found. `isSure`: it is known to be in the form.
    bool IsFirst(std::string_view document, bool isSure);

private:
    const std::string_view m_Text;
    std::optional<ovrin_yaml::WrittenFormReader<ovrin_yaml::BatchedBuilder>> m_Reader;
    bool m_IsFound = false;
};

} // namespace ovrin
