#include "Conflicts/OpenMerges.h"

#include "Descriptor.h"
#include "Destination.h"
#include "FileUtils.h"
#include "Names/PrintableText.h"
#include "Systems/Repository.h"
#include "Words/Failure.h"
#include "Words/WriteFailure.h"

#include <algorithm>
#include <cerrno>
#include <fcntl.h>
#include <filesystem>
#include <nlohmann/json.hpp>
#include <random>
#include <sys/file.h>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

namespace fs = std::filesystem;
using nlohmann::json;

constexpr const char* kMergeExtension = ".merge";
constexpr const char* kProgressExtension = ".progress";
constexpr std::uint64_t kPlaces = 4;                      // of a path; more where all of them are taken
constexpr std::size_t kMostHeader = std::size_t{1} << 20; // bytes

/// FNV-1a, of 64 bits, in hexadecimal digits. Paths of one number are told apart by what the files say.
std::string NumberOf(const std::string& path, std::uint64_t attempt) {
    std::uint64_t hash = 14695981039346656037u + attempt;
    for (const char character : path) hash = (hash ^ static_cast<unsigned char>(character)) * 1099511628211u;
    char digits[17];
    std::snprintf(digits, sizeof(digits), "%016llx", static_cast<unsigned long long>(hash));
    return digits;
}

std::string NewIdentity() {
    std::random_device device;
    std::string identity;
    for (int i = 0; i < 4; ++i) {
        char digits[9];
        std::snprintf(digits, sizeof(digits), "%08x", static_cast<unsigned>(device()));
        identity += digits;
    }
    return identity;
}

/// Labels may be of any bytes; they are only shown.
std::string TextOf(const json& value) {
    return value.dump(-1, ' ', false, json::error_handler_t::replace);
}

void Write(const std::string& file, const std::string& header, const std::vector<const std::string*>& parts,
           Durability durability) {
    Content content;
    content.size = header.size();
    for (const std::string* part : parts) content.size += part->size();
    content.write = [&](OutputStream& stream) {
        stream << header;
        for (const std::string* part : parts) stream << *part;
    };
    content.durability = durability;
    if (const int error = Deliver(file, content))
        throw Failure("Cannot write " + file + ": " + WhyNotWritten(error));
}

std::string HeaderOf(const OpenMerge& merge, const std::string& identity) {
    const Occasion& occasion = merge.occasion;
    const json header = {
        {"version", 1},
        {"identity", identity},
        {"process", merge.process},
        {"action", occasion.action},
        {"base", occasion.base},
        {"ours", occasion.ours},
        {"theirs", occasion.theirs},
        {"head", occasion.head},
        {"take", SideName(merge.take)},
        {"bothAdded", merge.isBothAdded},
        {"conflicts", merge.conflicts},
        {"sizes",
         {merge.path.size(), merge.rules.size(), merge.typeInfo.size(), merge.texts.base.size(),
          merge.texts.ours.size(), merge.texts.theirs.size()}},
    };
    return TextOf(header) + "\n";
}

/// The parts behind the header, in their order.
std::vector<std::string*> PartsOf(OpenMerge& merge) {
    return {&merge.path,       &merge.rules,      &merge.typeInfo,
            &merge.texts.base, &merge.texts.ours, &merge.texts.theirs};
}

enum class Extent { WithoutTexts, Whole };
constexpr std::size_t kPartsWithoutTexts = 3;

void TakeHeader(const json& header, OpenMerge& merge) {
    if (header.at("version") != 1) throw Failure("written by a newer version of ovrin");
    merge.identity = header.at("identity");
    merge.process = header.value("process", "");
    merge.occasion = {header.at("action"), header.at("base"), header.at("ours"), header.at("theirs"),
                      header.at("head")};
    merge.take = SideNamed(header.at("take").get<std::string>());
    merge.isBothAdded = header.at("bothAdded");
    merge.conflicts = header.at("conflicts");
}

OpenMerge Parse(const std::string& bytes, Extent extent) {
    const std::size_t end = bytes.find('\n');
    if (end == std::string::npos) throw Failure("cut off");
    OpenMerge merge;
    const json header = json::parse(bytes.begin(), bytes.begin() + static_cast<std::ptrdiff_t>(end));
    TakeHeader(header, merge);
    const auto sizes = header.at("sizes").get<std::vector<std::size_t>>();
    const auto parts = PartsOf(merge);
    const std::size_t wanted = extent == Extent::Whole ? parts.size() : kPartsWithoutTexts;
    std::size_t position = end + 1;
    for (std::size_t i = 0; i < wanted; ++i) {
        if (sizes.at(i) > bytes.size() - position) throw Failure("cut off");
        *parts[i] = bytes.substr(position, sizes[i]);
        position += sizes[i];
    }
    return merge;
}

/// Up to `most` bytes of a file.
std::string ReadBeginning(const std::string& file, std::size_t most) {
    const Descriptor descriptor = OpenFile(file.c_str(), O_RDONLY);
    if (!descriptor.IsOpen()) throw Failure(std::system_category().message(errno));
    std::string bytes;
    ssize_t count = 1;
    bytes.resize_and_overwrite(most, [&](char* buffer, std::size_t) {
        std::size_t length = 0;
        while (count > 0 && length < most) {
            count = Uninterrupted([&] { return read(descriptor.Get(), buffer + length, most - length); });
            length += static_cast<std::size_t>(std::max<ssize_t>(count, 0));
        }
        return length;
    });
    if (count < 0) throw Failure(std::system_category().message(errno));
    return bytes;
}

OpenMerge ReadMerge(const std::string& file, Extent extent) {
    try {
        std::string bytes;
        if (extent == Extent::WithoutTexts)
            bytes = ReadBeginning(file, kMostHeader);
        else if (ReadWholeFile(file, bytes) != ReadResult::Complete)
            throw Failure(std::system_category().message(errno));
        return Parse(bytes, extent);
    } catch (const std::exception& error) {
        throw Failure("Cannot read the open merge in " + file + ": " + error.what() +
                      ".\nRemove that file: conflicts that version control still knows of are found without "
                      "it; a scene that was added meanwhile must be looked through");
    }
}

/// Whether the file is the record of another scene. One that can't be made out is taken for the scene's whose
/// place it has, so that the next merge of that scene puts it right.
bool IsOfAnother(const std::string& file, const std::string& path) {
    try {
        return ReadMerge(file, Extent::WithoutTexts).path != path;
    } catch (const Failure&) {
        return false;
    }
}

json ToJson(const Progress& progress, const std::string& identity) {
    json decisions = json::array();
    for (const Decision& decision : progress.decisions)
        decisions.push_back({{"path", decision.path}, {"side", SideName(decision.side)}});
    json steps = json::array();
    for (const DecisionStep& step : progress.steps)
        steps.push_back({{"decisions", step.decisions}, {"number", step.number}});
    return {{"identity", identity}, {"open", progress.open}, {"decisions", decisions}, {"steps", steps}};
}

} // namespace

OpenMerges::OpenMerges(const Repository& repository) : m_Folder(repository.data + "/ovrin/") {}

/// Its record may stand behind a gap, which is left where that of another path of the same number was
/// removed.
OpenMerges::Place OpenMerges::PlaceOf(const std::string& path) const {
    std::string free;
    for (std::uint64_t attempt = 0; attempt < kPlaces || free.empty(); ++attempt) {
        const std::string file = m_Folder + NumberOf(path, attempt);
        const bool isMissing = IsMissing(file + kMergeExtension);
        if (!isMissing && !IsOfAnother(file + kMergeExtension, path)) return {file, true};
        if (isMissing && free.empty()) free = file;
    }
    return {free, false};
}

void OpenMerges::MakeFolder() const {
    std::error_code error;
    fs::create_directories(m_Folder, error);
    if (error) throw Failure("Cannot make the folder " + m_Folder + ": " + error.message());
}

void OpenMerges::Add(OpenMerge& merge) {
    MakeFolder();
    std::string identity = NewIdentity();
    const auto parts = PartsOf(merge);
    // As safe as what version control writes of the merge itself, also in the place of an earlier one.
    Write(PlaceOf(merge.path).file + kMergeExtension, HeaderOf(merge, identity), {parts.begin(), parts.end()},
          Durability::Passing);
    merge.identity = std::move(identity);
}

std::vector<OpenMerge> OpenMerges::List() const {
    std::vector<OpenMerge> merges;
    std::error_code error;
    for (const fs::directory_entry& entry : fs::directory_iterator(m_Folder, error))
        if (entry.path().extension() == kMergeExtension)
            merges.push_back(ReadMerge(entry.path().string(), Extent::WithoutTexts));
    if (error && error != std::errc::no_such_file_or_directory)
        throw Failure("Cannot look into " + m_Folder + ": " + error.message());
    std::ranges::sort(merges, {}, &OpenMerge::path);
    return merges;
}

bool OpenMerges::HasFellowOf(const OpenMerge& merge) const {
    if (merge.process.empty()) return false;
    std::error_code error;
    const fs::directory_iterator files(m_Folder, error);
    return std::any_of(begin(files), end(files), [&](const fs::directory_entry& entry) {
        if (entry.path().extension() != kMergeExtension) return false;
        try {
            const OpenMerge other = ReadMerge(entry.path().string(), Extent::WithoutTexts);
            return other.process == merge.process && other.occasion.head == merge.occasion.head;
        } catch (const Failure&) {
            return false;
        }
    });
}

std::optional<OpenMerge> OpenMerges::Find(const std::string& path) const {
    const Place place = PlaceOf(path);
    if (!place.isTaken) return {};
    return ReadMerge(place.file + kMergeExtension, Extent::Whole);
}

Progress OpenMerges::ProgressOf(const OpenMerge& merge) const {
    Progress progress{{}, merge.conflicts};
    const std::string file = PlaceOf(merge.path).file + kProgressExtension;
    std::string bytes;
    const ReadResult result = ReadWholeFile(file, bytes);
    if (result == ReadResult::CannotOpen && IsMissing(file)) return progress;
    try {
        if (result != ReadResult::Complete) throw Failure(std::system_category().message(errno));
        const json read = json::parse(bytes);
        if (read.at("identity") != merge.identity) return progress;
        progress.open = read.at("open");
        std::size_t inSteps = 0;
        for (const json& step : read.at("steps")) {
            progress.steps.push_back({step.at("decisions"), step.at("number")});
            inSteps += progress.steps.back().decisions;
        }
        for (const json& decision : read.at("decisions"))
            progress.decisions.push_back(
                {decision.at("path"), SideNamed(decision.at("side").get<std::string>())});
        if (inSteps != progress.decisions.size()) throw Failure("its steps don't add up");
    } catch (const std::exception& error) {
        throw Failure("Cannot read the decisions in " + file + ": " + error.what() +
                      ".\nRemove that file to decide anew");
    }
    return progress;
}

bool OpenMerges::IsStill(const OpenMerge& merge, const Progress& known) const {
    const Place place = PlaceOf(merge.path);
    if (merge.identity.empty() || !place.isTaken) return merge.identity.empty() && !place.isTaken;
    if (ReadMerge(place.file + kMergeExtension, Extent::WithoutTexts).identity != merge.identity)
        return false;
    const Progress progress = ProgressOf(merge);
    return progress.decisions == known.decisions && progress.steps == known.steps;
}

void OpenMerges::SetProgress(OpenMerge& merge, const Progress& known, const Progress& progress) {
    MakeFolder();
    // Nobody comes between the look and the step. Where there are no locks, people are slow enough.
    const Descriptor folder = OpenFile(m_Folder.c_str(), O_RDONLY | O_DIRECTORY);
    if (folder.IsOpen()) Uninterrupted([&] { return flock(folder.Get(), LOCK_EX); });
    if (!IsStill(merge, known))
        throw Failure(Printable(merge.path) +
                      " was settled elsewhere meanwhile, or its merge was ended or made again: nothing is "
                      "decided here. End this, and run \"ovrin settle\" again");
    try {
        if (merge.identity.empty()) Add(merge);
        // Nobody else has what a person decided.
        Write(PlaceOf(merge.path).file + kProgressExtension, TextOf(ToJson(progress, merge.identity)) + "\n",
              {}, Durability::Synced);
    } catch (const Failure& failure) {
        throw Failure(failure.what() + (". What is decided in " + Printable(merge.path)) +
                      " stays as it was: set that right, and decide again");
    }
}

void OpenMerges::Remove(const std::string& path) {
    const Place place = PlaceOf(path);
    for (const char* extension : {kProgressExtension, kMergeExtension}) {
        std::error_code error;
        if (place.isTaken && !fs::remove(place.file + extension, error) && error)
            throw Failure("Cannot remove " + place.file + extension + ": " + error.message());
    }
    std::error_code ignored; // the folder goes with the last one
    fs::remove(m_Folder, ignored);
}

} // namespace ovrin
