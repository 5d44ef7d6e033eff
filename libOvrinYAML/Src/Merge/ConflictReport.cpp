#include "Merge/ConflictReport.h"

#include "Diff/DiffText.h"
#include "Diff/YAMLDiffOutput.h"
#include "Merge/PathRanks.h"

#include <algorithm>
#include <cstdint>
#include <istream>
#include <ostream>
#include <stdexcept>
#include <string_view>

namespace ovrin_yaml {

const char* const kConflictHeader = "Conflicts:";
const char* const kConflictHandlingHeader = "Conflict handling:";
const char* const kNonConflictHandlingHeader = "Non-conflicts:";

namespace {

using Record = RecordingConflictResolver::Record;

struct HandlingWord {
    MergeResolve resolve;
    const char* written;
    const char* read; // compared with the line's word in lower case
};

/// A decision can't break a cycle: its word is compared in lower case and never matches.
constexpr HandlingWord kHandlingWords[] = {
    {ResolveLeft, "Left", "left"},
    {ResolveRight, "Right", "right"},
    {ResolveBase, "Base", "base"},
    {ResolveBreakCycle, "BreakCycle", "breakCycle"},
};

/// A record and the rank of its path among those of all that are sorted; at first the path's index.
struct RankedRecord {
    std::uint32_t rank;
    const Record* record;
};

/// The records that are to be written, pending ones or all, in the order that std::sort gives all of them by
/// path.
///
/// Ranks are compared, for which std::sort takes the same decisions as for the paths of records, so that
/// those of one path, which it may bring into any order, come out in the same one. Where no path comes twice
/// among the pending records, their order is settled without the others.
std::vector<RankedRecord> RecordsByPath(std::span<const Record> records, bool all) {
    std::vector<RankedRecord> sorted;
    PathRanks paths;
    for (const Record& record : records)
        if (all || record.resolve == ResolveConflict) sorted.push_back({paths.Add(record.path), &record});
    const std::vector<std::uint32_t> ranks = paths.Ranks();
    for (RankedRecord& ranked : sorted) ranked.rank = ranks[ranked.rank];
    std::sort(sorted.begin(), sorted.end(),
              [](const RankedRecord& a, const RankedRecord& b) { return a.rank < b.rank; });
    const auto haveOnePath = [](const RankedRecord& a, const RankedRecord& b) { return a.rank == b.rank; };
    if (all || std::adjacent_find(sorted.begin(), sorted.end(), haveOnePath) == sorted.end()) return sorted;
    return RecordsByPath(records, true);
}

void OutputSide(YAMLDiffOutput& output, const char* side, const std::string& path,
                const Operation* operation) {
    output << side << path << " ";
    if (operation) OutputOperation(*operation, output);
    output.EndLineIfOpen();
}

void OutputConflict(YAMLDiffOutput& output, const Record& record) {
    const std::string path = PathToString(record.path);
    if (record.type == ConflictTransformCycle) {
        OutputSide(output, "BreakCycle  ", path, nullptr);
        return;
    }
    OutputSide(output, "Left  ", path, record.left);
    OutputSide(output, "Right ", path, record.right);
}

void OutputResolve(YAMLDiffOutput& output, const RecordResolve& decision) {
    for (const HandlingWord& word : kHandlingWords)
        if (word.resolve == decision.resolve) output << word.written;
    output << " " << PathToString(decision.path) << endl;
}

void OutputNonConflict(YAMLDiffOutput& output, const Record& record) {
    output.EndLineIfOpen();
    output << ConflictTypeToStringHuman(record.type) << " " << PathToString(record.path) << " ";
    if (!IsOneSided(record.type)) {
        output << "content" << endl;
    } else if (const Operation* operation = IsLeftSide(record.type) ? record.left : record.right) {
        OutputOperation(*operation, output);
    } else {
        output << endl;
    }
}

void OutputNonConflicts(YAMLDiffOutput& output, const std::vector<RankedRecord>& records) {
    output << kNonConflictHandlingHeader << endl;
    for (const auto& [rank, record] : records)
        if (record->resolve != ResolveConflict && record->type != ConflictBothChanges)
            OutputNonConflict(output, *record);
}

bool BeginsWith(const std::string& line, const char* header) {
    return std::string_view(line).starts_with(header);
}

std::string HandlingWordOf(const std::string& line) {
    const std::size_t blank = line.find(' ');
    if (blank == std::string::npos)
        throw std::runtime_error("No handling type (left,right,base) specified on line 1");
    std::string word = line.substr(0, blank);
    for (char& c : word)
        if (c >= 'A' && c <= 'Z') c = static_cast<char>(c - 'A' + 'a');
    return word;
}

Path PathOf(const std::string& line) {
    const std::size_t begin = line.find_first_not_of(' ', line.find(' '));
    if (begin == std::string::npos) throw std::runtime_error("No property path specified on line 1");
    return StringToPath(line.substr(begin, line.find(' ', begin) - begin));
}

/// Reads one line of the handling section. The line number in the messages is always 1.
void InputResolve(const std::string& line, std::vector<RecordResolve>& resolves) {
    const std::string word = HandlingWordOf(line);
    const auto known = std::find_if(std::begin(kHandlingWords), std::end(kHandlingWords),
                                    [&](const HandlingWord& candidate) { return word == candidate.read; });
    if (known != std::end(kHandlingWords))
        resolves.push_back({PathOf(line), known->resolve});
    else if (line[0] != '>')
        throw std::runtime_error("Unknown handling type '" + word +
                                 "' (should be left,right or base) specified on line 1");
}

} // namespace

Path StringToPath(const std::string& text) {
    Path path;
    if (text.empty()) return path;
    for (std::size_t begin = 0;;) {
        const std::size_t end = text.find('.', begin);
        path.push_back(YAMLScalar::Lookup(std::string_view(text).substr(begin, end - begin)));
        if (end == std::string::npos) return path;
        begin = end + 1;
    }
}

void OutputConflictRecords(std::ostream& out, const RecordingConflictResolver& resolver, bool describe) {
    constexpr std::size_t kIndentWidth = 2;
    YAMLDiffOutput output(out, kIndentWidth);
    const std::vector<RankedRecord> records = RecordsByPath(resolver.Records(), describe);
    output << kConflictHeader << endl;
    for (const auto& [rank, record] : records)
        if (record->resolve == ResolveConflict) OutputConflict(output, *record);
    output.EndLineIfOpen();
    output << kConflictHandlingHeader << endl;
    for (const RecordResolve& decision : resolver.Resolves()) OutputResolve(output, decision);
    if (describe) OutputNonConflicts(output, records);
    output.Finish();
}

std::vector<const Record*> PendingByPath(std::span<const Record> records) {
    std::vector<const Record*> pending;
    for (const auto& [rank, record] : RecordsByPath(records, false))
        if (record->resolve == ResolveConflict) pending.push_back(record);
    return pending;
}

std::vector<RecordResolve> ReadDecisions(std::istream& in) {
    std::vector<RecordResolve> resolves;
    bool inHandlingSection = false;
    std::string line;
    while (std::getline(in, line)) {
        if (line.empty() || line[0] == '#') continue;
        if (BeginsWith(line, kConflictHeader))
            inHandlingSection = false;
        else if (BeginsWith(line, kConflictHandlingHeader))
            inHandlingSection = true;
        else if (BeginsWith(line, kNonConflictHandlingHeader))
            break;
        else if (inHandlingSection)
            InputResolve(line, resolves);
    }
    return resolves;
}

} // namespace ovrin_yaml
