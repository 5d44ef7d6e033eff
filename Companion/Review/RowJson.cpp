#include "Review/RowJson.h"

#include "Conflicts/Conflict.h"
#include "Names/PrintableText.h"
#include "Names/ValueLines.h"

#include <nlohmann/json.hpp>

namespace ovrin {

using namespace ovrin_yaml;
using nlohmann::json;

namespace {

constexpr std::size_t kMostText = std::size_t{64} * 1024;

/// The beginning of a text that is UTF-8, of whole characters.
std::string Beginning(std::string text, std::size_t most) {
    if (text.size() <= most) return text;
    while (most > 0 && (static_cast<unsigned char>(text[most]) & 0xC0U) == 0x80U) --most;
    text.resize(most);
    return text;
}

std::string TextOf(const YAMLNode& value, const ObjectNames& names) {
    const std::vector<std::string> lines = ValueLines(value, names);
    std::string text;
    for (std::size_t i = 0; i < lines.size() && text.size() <= kMostText; ++i) {
        if (i > 0) text += '\n';
        text += lines[i];
    }
    return text;
}

json ValueJson(const YAMLNode* value, ValueShape shape, const ObjectNames& names) {
    if (!value) return nullptr;
    std::string text = TextOf(*value, names);
    const bool isShortened = text.size() > kMostText;
    json written = {{"text", Beginning(std::move(text), kMostText)}};
    if (isShortened) written["isShortened"] = true;
    if (shape == ValueShape::Number || shape == ValueShape::Colour || shape == ValueShape::Vector)
        if (std::vector<double> numbers = NumbersOf(*value); !numbers.empty())
            written["numbers"] = std::move(numbers);
    if (shape == ValueShape::Reference)
        if (const YAMLScalar* target = LocalReference(value); target && names.Has(target))
            written["target"] = Printable(target->Value());
    return written;
}

/// Of an object as a whole: what each side did to it.
json WholeJson(const ObjectRow& row, std::size_t column) {
    const YAMLNode* value = row.values[column];
    const auto& record = row.conflict->about->record;
    if (column == 1 || column == 2)
        return {{"text", ObjectWords(column == 1 ? record.right : record.left, value)}};
    return value ? json{{"text", "there"}} : json();
}

const char* StateOf(const ObjectRow& row) {
    if (row.conflict) return row.conflict->isOpen ? "open" : "settled";
    if (row.byOurs && row.byTheirs) return "both";
    if (row.byOurs) return "ours";
    return row.byTheirs ? "theirs" : "same";
}

} // namespace

json RowJson(const ObjectRow& row, const std::array<const ObjectNames*, 4>& names) {
    static constexpr const char* kColumns[] = {"base", "ours", "theirs", "result"};
    json written = {{"property", row.property},
                    {"place", Printable(row.place)},
                    {"item", row.conflict ? json(row.conflict->item) : json()},
                    {"type", ShapeName(row.shape)},
                    {"state", StateOf(row)}};
    const bool isWhole = row.property.empty() && row.conflict;
    for (std::size_t i = 0; i < names.size(); ++i)
        written["values"][kColumns[i]] =
            isWhole ? WholeJson(row, i) : ValueJson(row.values[i], row.shape, *names[i]);
    return written;
}

} // namespace ovrin
