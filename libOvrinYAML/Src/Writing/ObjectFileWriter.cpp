#include "Writing/ObjectFileWriter.h"

#include "Values/YAMLScalar.h"
#include "Writing/WrittenForm.h"
#include "Writing/YAMLEmitter.h"

#include <algorithm>
#include <array>
#include <exception>
#include <ostream>
#include <utility>
#include <vector>

namespace ovrin_yaml {

namespace {

constexpr std::string_view kTagAuthority = OVRIN_TAG_AUTHORITY;

/// Hands text to a stream in pieces that make calls cheap. Untouched objects that are neighbours in the file
/// that was read go out as one range of its bytes, and a long range isn't copied on the way.
class Pieces {
public:
    explicit Pieces(std::ostream& stream) : m_Stream(stream) {}

    /// Where text is appended that stands behind all that was put so far.
    std::string& Own() {
        EndRange();
        if (m_Own.size() >= kPieceSize) WriteOwn();
        return m_Own;
    }
    /// Takes bytes that stay until Flush.
    void Put(std::string_view bytes) {
        if (m_Range.data() + m_Range.size() == bytes.data()) {
            m_Range = {m_Range.data(), m_Range.size() + bytes.size()};
        } else {
            EndRange();
            m_Range = bytes;
        }
    }
    void Flush() {
        EndRange();
        WriteOwn();
    }

private:
    static constexpr std::size_t kPieceSize = std::size_t{1} << 18;
    static constexpr std::size_t kLongRange = std::size_t{1} << 14;

    void EndRange() {
        if (m_Range.size() < kLongRange) {
            m_Own += m_Range;
        } else {
            WriteOwn();
            Write(m_Range);
        }
        m_Range = {};
    }
    void WriteOwn() {
        Write(m_Own);
        m_Own.clear();
    }
    void Write(std::string_view text) {
        m_Stream.write(text.data(), static_cast<std::streamsize>(text.size()));
    }

    std::ostream& m_Stream;
    std::string m_Own;
    std::string_view m_Range; // behind m_Own
};

void AppendHeaderLine(const YAMLScalar& rootKey, const YAMLMapping& object, std::string& text) {
    const YAMLScalar* fileID = AsScalar(object.Get(YAMLScalar::fileIDPlaceHolderName));
    const YAMLScalar* classID = AsScalar(object.Get(YAMLScalar::classIDPlaceHolderName));
    if (!fileID) fileID = &rootKey;
    if (!classID) throw YAMLError("Object has no class id: " + std::string(fileID->Value()));
    text.append(kDocumentStart).append(classID->Value()).append(kAnchor).append(fileID->Value());
    if (object.HasKey(YAMLScalar::strippedPrefabPlaceHolderName)) text.append(kStripped);
    text.push_back('\n');
}

} // namespace

void AppendObjectBody(const YAMLMapping& object, std::string& text) {
    std::vector<const YAMLScalar*> keys;
    std::vector<YAMLNode*> values;
    for (const YAMLMapping::Entry entry : object) {
        if (IsPlaceHolderKey(entry.key)) continue;
        keys.push_back(entry.key);
        values.push_back(entry.value);
    }
    YAMLEmitter(text).EmitDocument({keys.data(), values.data(), keys.size()}, object.m_Flow);
}

void AppendObject(const YAMLScalar& rootKey, const YAMLMapping& object, std::string& text) {
    AppendHeaderLine(rootKey, object, text);
    AppendObjectBody(object, text);
    text.push_back('\n');
}

namespace {

/// Puts an object, if the entry holds one, to what takes bytes that stay (Put) and text that is appended
/// (Own).
template <class Target> void PutObject(const YAMLMapping::Entry& entry, Target& target) {
    if (!entry.key) return;
    const YAMLMapping& object = ToMapping(entry.value);
    if (!object.Source().empty())
        target.Put(object.Source());
    else
        AppendObject(*entry.key, object, target.Own());
}

/// Whether it is worth the while to write objects on several threads, as far as some of them tell.
bool AreManyChanged(const YAMLMapping::Pairs& entries) {
    constexpr std::size_t kMany = 1000;
    const std::size_t step = entries.size() / kMany;
    if (step == 0) return false;
    std::size_t seen = 0, changed = 0;
    for (std::size_t i = 0; i < entries.size(); i += step, ++seen)
        if (const YAMLMapping* object = AsMapping(entries[i].value); object && object->Source().empty())
            ++changed;
    return changed >= seen / 8;
}

/// A few of many objects that are written one behind the other.
struct Group {
    std::string text;
    std::exception_ptr failure; // at the object behind the text

    std::string& Own() { return text; }
    void Put(std::string_view bytes) { text += bytes; }
    void Write(const YAMLMapping::Pairs& entries, std::size_t first, std::size_t end) {
        try {
            for (std::size_t i = first; i < end; ++i) PutObject(entries[i], *this);
        } catch (...) {
            failure = std::current_exception();
        }
    }
};

using Groups = std::array<Group, 32>;

/// Leaves the groups empty. Throws the first failure.
void PutGroups(Groups& groups, Pieces& pieces) {
    for (const Group& group : groups) {
        if (group.failure) std::rethrow_exception(group.failure);
        pieces.Put(group.text);
    }
    pieces.Flush();
    for (Group& group : groups) group.text.clear();
}

/// Writes groups of objects at the same time: so many that the threads have enough to do, and so few that
/// little waits in memory. What one round has written is put out beside the next. The first failure in the
/// order of the objects is the one that is thrown.
void PutInGroups(const YAMLMapping::Pairs& entries, Pieces& pieces, const TaskRunner& run) {
    constexpr std::size_t kGroupSize = 256;
    std::array<Groups, 2> rounds;
    Groups *groups = &rounds[0], *before = &rounds[1];
    for (std::size_t first = 0; first < entries.size(); first += groups->size() * kGroupSize) {
        const std::size_t left = entries.size() - first;
        const std::size_t count = std::min(groups->size(), (left + kGroupSize - 1) / kGroupSize);
        run(count + 1, [&](std::size_t i) {
            if (i == 0) return PutGroups(*before, pieces);
            const std::size_t begin = first + (i - 1) * kGroupSize;
            (*groups)[i - 1].Write(entries, begin, std::min(begin + kGroupSize, entries.size()));
        });
        std::swap(groups, before);
    }
    PutGroups(*before, pieces);
}

} // namespace

std::string_view TagAuthority() {
    return kTagAuthority;
}

void Output(const OvrinObjects& objects, std::ostream& stream, const TaskRunner& run) {
    objects.GetMapping().RequireNormalState();
    const YAMLMapping::Pairs entries = objects.GetMapping().RawEntries();
    Pieces pieces(stream);
    pieces.Own().append(kFileHeaderStart).append(kTagAuthority).append(kFileHeaderEnd);
    if (run && AreManyChanged(entries))
        PutInGroups(entries, pieces, run);
    else
        for (const YAMLMapping::Entry entry : entries) PutObject(entry, pieces);
    pieces.Flush();
    stream.flush();
}

} // namespace ovrin_yaml
