#include "Settle/EarlierDecisions.h"

#include "Conflicts/DecisionPath.h"
#include "Destination.h"
#include "FileUtils.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"

#include "Values/SeededHash.h"
#include "Values/YAMLMapping.h"
#include "Values/YAMLScalar.h"
#include "Values/YAMLSequence.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <filesystem>
#include <random>
#include <sstream>
#include <system_error>
#include <utility>

namespace ovrin {

using namespace ovrin_yaml;

namespace {

constexpr const char* kBeginning = "ovrin decisions 1 ";

void AddText(std::string& text, char kind, std::string_view value) {
    text += kind;
    text += std::to_string(value.size()) + ':';
    text += value;
}

/// A value as a text that no other value has.
void AddValue(std::string& text, const YAMLNode* value) {
    if (const YAMLScalar* scalar = AsScalar(value)) return AddText(text, 's', scalar->Value());
    if (const YAMLMapping* mapping = AsMapping(value)) {
        text += '{';
        for (const auto& [key, field] : *mapping) {
            AddText(text, 'k', key->Value());
            AddValue(text, field);
        }
        text += '}';
    } else if (const YAMLSequence* list = AsSequence(value)) {
        text += '[';
        for (const YAMLNode* item : list->m_Items) AddValue(text, item);
        text += ']';
    } else {
        text += '-';
    }
}

std::string HexOf(const std::array<std::uint64_t, 2>& key) {
    char digits[33];
    std::snprintf(digits, sizeof(digits), "%016llx%016llx", static_cast<unsigned long long>(key[0]),
                  static_cast<unsigned long long>(key[1]));
    return digits;
}

std::array<std::uint64_t, 2> KeyFrom(const std::string& digits) {
    const bool isHex = digits.find_first_not_of("0123456789abcdef") == std::string::npos;
    if (digits.size() != 32 || !isHex) throw Failure("\"" + digits.substr(0, 40) + "\" is no key");
    return {std::stoull(digits.substr(0, 16), nullptr, 16), std::stoull(digits.substr(16), nullptr, 16)};
}

std::array<std::uint64_t, 2> NewSecret() {
    std::random_device device;
    const auto half = [&] { return (std::uint64_t{device()} << 32) | device(); };
    const std::uint64_t first = half();
    return {first, half()};
}

EarlierDecisions::Values Swapped(EarlierDecisions::Values conflict) {
    std::swap(conflict.values[static_cast<std::size_t>(Side::Ours)],
              conflict.values[static_cast<std::size_t>(Side::Theirs)]);
    return conflict;
}

Side Mirrored(Side side) {
    return side == Side::Ours ? Side::Theirs : side == Side::Theirs ? Side::Ours : Side::Base;
}

} // namespace

std::optional<EarlierDecisions::Values> EarlierDecisions::Values::Of(const OpenConflict& conflict,
                                                                     const RecordPlaces& places) {
    if (conflict.kind == ConflictKind::KeyOrder) return {};
    const RecordPlace place = places.Find(conflict.record);
    return Values{DecisionPath(conflict.path),
                  {place.In(Version::Base), place.In(Version::Ours), place.In(Version::Theirs)}};
}

EarlierDecisions::EarlierDecisions(const Repository& repository)
    : m_Folder(repository.data + "/ovrin/"), m_Secret(NewSecret()) {}

EarlierDecisions::Key EarlierDecisions::KeyOf(const Values& conflict) const {
    std::string text;
    AddText(text, 'p', conflict.path);
    for (const YAMLNode* value : conflict.values) AddValue(text, value);
    return {SipHash13(text, m_Secret), SipHash13(text, {~m_Secret[0], m_Secret[1]})};
}

void EarlierDecisions::Read() {
    const std::string file = m_Folder + "decisions";
    std::string text;
    const ReadResult result = ReadWholeFile(file, text);
    if (result == ReadResult::CannotOpen && IsMissing(file)) return;
    try {
        if (result != ReadResult::Complete) throw Failure(std::system_category().message(errno));
        ReadLines(text);
    } catch (const Failure& failure) {
        m_Sides.clear();
        throw Failure("Earlier decisions can't be proposed: " + file + " can't be made out (" +
                      failure.what() + ")");
    }
}

void EarlierDecisions::ReadLines(const std::string& text) {
    std::istringstream lines(text);
    // A stream takes a lack of memory for the end of the text, unless it is told not to.
    lines.exceptions(std::ios_base::badbit);
    std::string line;
    std::getline(lines, line);
    if (!line.starts_with(kBeginning)) throw Failure("another version may have written it");
    m_Secret = KeyFrom(line.substr(std::string(kBeginning).size()));
    while (std::getline(lines, line)) {
        const std::size_t blank = std::min(line.find(' '), line.size() - 1);
        m_Sides[KeyFrom(line.substr(0, blank))] = {SideNamed(line.substr(blank + 1)), m_Next};
        ++m_Next;
    }
}

std::optional<Side> EarlierDecisions::Find(const Values& conflict) const {
    if (const auto found = m_Sides.find(KeyOf(conflict)); found != m_Sides.end()) return found->second.side;
    const auto found = m_Sides.find(KeyOf(Swapped(conflict)));
    return found == m_Sides.end() ? std::nullopt : std::optional(Mirrored(found->second.side));
}

void EarlierDecisions::Add(const Values& conflict, Side side) {
    m_Sides.erase(KeyOf(Swapped(conflict)));
    m_Sides[KeyOf(conflict)] = {side, m_Next++};
}

void EarlierDecisions::Keep() const {
    std::vector<std::pair<std::uint64_t, const std::pair<const Key, Decided>*>> byAge;
    for (const auto& decided : m_Sides) byAge.emplace_back(decided.second.number, &decided);
    std::ranges::sort(byAge);
    const std::size_t first = byAge.size() > kMost ? byAge.size() - kMost : 0;
    std::string text = kBeginning + HexOf(m_Secret) + '\n';
    for (std::size_t i = first; i < byAge.size(); ++i)
        text += HexOf(byAge[i].second->first) + ' ' + SideName(byAge[i].second->second.side) + '\n';
    std::error_code made;
    std::filesystem::create_directories(m_Folder, made);
    const Content content{text.size(), [&](OutputStream& stream) { stream << text; }, Durability::Unsynced};
    if (const int error = Deliver(m_Folder + "decisions", content))
        throw Failure("Decisions can't be kept for proposals in " + m_Folder +
                      "decisions: " + std::system_category().message(error));
}

} // namespace ovrin
