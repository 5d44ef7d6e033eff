#include "Reading/ObjectFile.h"

#include "Reading/DocumentCut.h"
#include "Reading/DocumentTreeMaker.h"
#include "Reading/LibraryReader.h"
#include "Reading/OwnText.h"
#include "Reading/ReaderPool.h"
#include "Values/ScalarTable.h"
#include "Values/YAMLScalar.h"
#include "Writing/WrittenForm.h"

#include <algorithm>
#include <array>
#include <cassert>
#include <cstring>
#include <utility>

namespace ovrin_yaml {

namespace {

/// Text that is read at one go: enough for a reader to get to know the common texts, little enough to share
/// out.
constexpr std::size_t kPieceBytes = std::size_t{1} << 20;

/// Where ids of the base are looked for, again and again: no further, since a header line may be as long as
/// the file. A document whose id stands behind it is shared with nobody.
constexpr std::size_t kUsualHeader = 128;

} // namespace

ObjectFile::ObjectFile(OvrinObjects& objects, ReaderOptions options)
    : m_Objects(objects), m_Options(options), m_Pool(std::make_unique<ReaderPool>()) {}

ObjectFile::~ObjectFile() = default;

/// That of the base, which may know the keys already.
ReaderPool& ObjectFile::Pool() {
    return m_Base ? *m_Base->m_Pool : *m_Pool;
}

std::string_view ObjectFile::FileIDOf(const Document& document) {
    return ovrin_yaml::FileIDOf({document.begin, document.length});
}

/// The same of a header line of usual length; of any other it may be empty, or less of the id.
std::string_view ObjectFile::UsualIDOf(const Document& document) {
    return ovrin_yaml::FileIDOf({document.begin, std::min(document.length, kUsualHeader)});
}

void ObjectFile::Take(std::string bytes) {
    const std::size_t length = std::min(bytes.find('\0'), bytes.size());
    TakeCut({std::move(bytes), length, {}});
}

void ObjectFile::TakeCut(CutText text) {
    if (!HasSignature(text.bytes))
        throw YAMLError(
            "File is not a valid text serialized YAML file. Make sure that Asset Serialization is "
            "set to 'Force text' in Editor Settings.");
    text.bytes.resize(text.length);
    TakeText(std::move(text.bytes));
    m_Starts = std::move(text.starts);
}

void ObjectFile::TakeText(std::string text) {
    m_Text = std::make_shared<const std::string>(std::move(text));
    m_Length = m_Text->size();
    m_Header = FileHeaderOf(*m_Text);
}

bool ObjectFile::TakeAlong(ByteSource source, std::size_t size, ObjectFile& base) {
    if (!MayShareWith(base)) return false;
    TextWindow window(std::move(source), m_Options.window);
    // One that begins with the header of another object file has the signature.
    const bool hasItsHeader = window.Reaches(base.m_Header.size() + kDocumentStart.size()) &&
                              window.Rest().starts_with(base.m_Header) &&
                              window.Rest().substr(base.m_Header.size()).starts_with(kDocumentStart);
    if (!hasItsHeader) return false;
    BecomeTakerOf(base);
    CutAlong(base, window, size);
    return true;
}

void ObjectFile::Cut(ObjectFile* base) {
    if (base) BecomeTakerOf(*base);
    if (!m_Options.fast || !HasWrittenHeader(*m_Text)) return;
    if (base && MayShareWith(*base) && m_Header == base->m_Header) {
        const auto text = m_Text;
        TextWindow window(*text);
        CutAlong(*base, window, text->size());
    } else {
        CutAlone();
        if (m_Options.recognise) m_Maker = std::make_shared<DocumentTreeMaker>(m_Text);
    }
}

/// A file that then can't be cut along the base wants none of its documents.
void ObjectFile::BecomeTakerOf(ObjectFile& base) {
    const std::lock_guard lock(base.m_TakersLock);
    base.m_Takers.push_back(this);
}

/// Whether documents of a file that is cut may be shared.
bool ObjectFile::MayShareWith(const ObjectFile& base) const {
    return m_Options.fast && m_Options.share && !base.m_Documents.empty();
}

void ObjectFile::CutAlone() {
    constexpr std::size_t kBytesPerDocument = 400;
    m_Documents.reserve(m_Starts.empty() ? m_Text->size() / kBytesPerDocument : m_Starts.size() + 1);
    const char* begin = m_Text->data() + m_Header.size();
    const auto addUpTo = [&](const char* end) {
        m_Documents.push_back({begin, static_cast<std::size_t>(end - begin)});
        begin = end;
    };
    for (const std::size_t start : m_Starts)
        if (start > m_Header.size()) addUpTo(m_Text->data() + start);
    while (begin != End()) addUpTo(m_Starts.empty() ? FindDocumentEnd(begin, End()) : End());
    m_Starts = {};
    if (!m_Documents.empty()) m_Runs.push_back({0, m_Documents.size(), false});
}

void ObjectFile::AddToRun(std::size_t document, bool isLent) {
    Run* const last = m_Runs.empty() ? nullptr : &m_Runs.back();
    if (last && last->isLent == isLent && last->first + last->count == document)
        ++last->count;
    else
        m_Runs.push_back({document, 1, isLent});
}

/// Whether the base's document stands here in the same words and ends here, too.
bool ObjectFile::StandsAt(const Document& document, TextWindow& window) {
    window.Reaches(document.length + kDocumentStart.size());
    const std::string_view text = window.Rest();
    if (!text.starts_with(std::string_view(document.begin, document.length))) return false;
    if (text.size() == document.length) return true;
    return text[document.length - 1] == '\n' && text.substr(document.length).starts_with(kDocumentStart);
}

/// Most documents follow each other as they do in the base, so the base's next one is tried before any
/// search. What doesn't stand there is kept.
void ObjectFile::CutAlong(ObjectFile& base, TextWindow& window, std::size_t size) {
    m_Base = &base;
    const DocumentList& known = base.m_Documents;
    OwnText own(size);
    m_Length = base.m_Header.size();
    std::size_t length = 0;
    std::size_t expected = 0;
    for (window.Skip(m_Length); window.Reaches(1); window.Skip(length), m_Length += length) {
        if (expected < known.size() && StandsAt(known[expected], window)) {
            length = known[expected].length;
            AddToRun(expected, true);
            ++expected;
            continue;
        }
        const std::string_view document = window.Document();
        length = document.size();
        if (const std::size_t lender = FindLender(document, expected); lender != kNone) {
            AddToRun(lender, true);
        } else {
            AddToRun(m_Documents.size(), false);
            m_Documents.push_back({nullptr, length});
            own.Append(document, m_Length);
        }
    }
    KeepOwn(own.Take());
}

/// Takes the texts of the documents that no other file lends, one behind the other.
void ObjectFile::KeepOwn(std::string own) {
    m_Text = std::make_shared<const std::string>(std::move(own));
    m_Header = m_Base->m_Header;
    m_HasWholeText = false;
    const char* position = m_Text->data();
    for (Document& document : m_Documents) {
        document.begin = position;
        position += document.length;
    }
}

/// Calls visit(documents, bytes) for each run.
template <class Visit> void ObjectFile::ForEachRun(const Visit& visit) const {
    for (const Run& run : m_Runs) {
        const Document* first = &(run.isLent ? m_Base : this)->m_Documents[run.first];
        const Document& last = first[run.count - 1];
        visit(run, std::string_view(first->begin, last.begin + last.length));
    }
}

/// For what goes by the place in the file.
void ObjectFile::NeedWholeText() {
    if (m_HasWholeText) return;
    std::string whole(m_Header);
    whole.reserve(m_Length);
    ForEachRun([&](const Run&, std::string_view bytes) { whole += bytes; });
    const char* position = whole.data() + m_Header.size();
    ForEachRun([&](const Run& run, std::string_view bytes) {
        for (std::size_t i = run.first; !run.isLent && i < run.first + run.count; ++i)
            m_Documents[i].begin = position + (m_Documents[i].begin - bytes.data());
        position += bytes.size();
    });
    m_Text = std::make_shared<const std::string>(std::move(whole));
    m_HasWholeText = true;
}

/// For a document that isn't the expected one; `expected` becomes the one behind the base's of the same id.
std::size_t ObjectFile::FindLender(std::string_view document, std::size_t& expected) {
    const std::size_t index = FindInBase(ovrin_yaml::FileIDOf(document), expected);
    if (index == kNone) return kNone;
    expected = index + 1;
    const Document& known = m_Base->m_Documents[index];
    return document == std::string_view(known.begin, known.length) ? index : kNone;
}

/// The base's document of an id. Where a few were removed it is near the one that was expected; one that
/// isn't there is nearly always new, and one that was only moved may be read twice. So the base is indexed,
/// which costs a look at each of its documents, only for files in which many aren't found.
std::size_t ObjectFile::FindInBase(std::string_view fileID, std::size_t expected) {
    constexpr std::size_t kNear = 16;
    constexpr std::size_t kManyUnfound = 256;
    if (m_UnfoundCount == kManyUnfound) return m_Base->IndexOf(fileID);
    const DocumentList& known = m_Base->m_Documents;
    const std::size_t end = std::min(expected + kNear, known.size());
    for (std::size_t i = expected; i < end; ++i)
        if (UsualIDOf(known[i]) == fileID) return i;
    ++m_UnfoundCount;
    return kNone;
}

std::size_t ObjectFile::IndexOf(std::string_view fileID) const {
    // Not std::call_once: a lack of memory can't get through the frames of the C library.
    const std::lock_guard lock(m_IndexLock);
    const auto idOf = [this](std::size_t i) { return UsualIDOf(m_Documents[i]); };
    if (m_Index.IsEmpty()) m_Index.Build(m_Documents.size(), idOf);
    return m_Index.Find(fileID, idOf);
}

/// Which file wants which document.
void ObjectFile::NoteWants() {
    std::uint8_t bit = 1;
    for (const ObjectFile* taker : m_Takers) {
        for (const Run& run : taker->m_Runs)
            for (std::size_t i = run.first; run.isLent && i < run.first + run.count; ++i)
                m_Documents[i].wantedBy |= bit;
        bit = static_cast<std::uint8_t>(bit << 1);
    }
}

std::size_t ObjectFile::MakePieces() {
    assert(m_Takers.size() <= 8 && "a bit for each");
    NoteWants();
    std::size_t bytes = 0, bytesToBuild = 0;
    Piece piece{0, 0};
    for (std::size_t i = 0; i < m_Documents.size(); ++i) {
        const Document& document = m_Documents[i];
        bytes += document.length;
        if (!IsWantedByAll(document)) bytesToBuild += document.length;
        piece.end = i + 1;
        if (bytes < kPieceBytes && piece.end != m_Documents.size()) continue;
        m_Pieces.push_back(piece);
        piece = {piece.end, piece.end};
        bytes = 0;
    }
    // One that failed while it was cut may have no text.
    for (const ObjectFile* taker : m_Takers)
        if (taker->m_Base && taker->m_Text) bytesToBuild += taker->m_Text->size();
    // A guess that spares the table most of its growing.
    constexpr std::size_t kBytesPerScalar = 56;
    if (!m_Base) ScalarTable::Instance().Reserve(m_Documents.size() + bytesToBuild / kBytesPerScalar);
    return m_Pieces.size();
}

void ObjectFile::ReadPiece(std::size_t piece) {
    Pool().With(End(), [&](DocumentReaders& readers) {
        for (std::size_t i = m_Pieces[piece].first; i < m_Pieces[piece].end; i += kAtOnce)
            ReadDocuments(readers, {&m_Documents[i], std::min(kAtOnce, m_Pieces[piece].end - i)});
    });
}

void ObjectFile::ReadDocuments(DocumentReaders& readers, std::span<Document> documents) const {
    for (Document& document : documents)
        if (!IsWantedByAll(document) || !Recognise(readers, document)) Read(readers, document);
    readers.InternTexts();
    InternIDs(documents);
    for (Document& document : documents)
        if (document.object && document.object->IsBuilt()) Complete(document);
}

bool ObjectFile::IsWantedByAll(const Document& document) const {
    return m_Maker && !m_Takers.empty() && document.wantedBy == (1u << m_Takers.size()) - 1;
}

/// False for an object whose tree is needed: one that would be written in another way, which goes by the
/// tree, or that nobody may share.
bool ObjectFile::Recognise(DocumentReaders& readers, Document& document) const {
    const std::string_view text(document.begin, document.length);
    const auto [object, isAsWritten] = readers.Recognisers().Read(text, kFileHeaderLines);
    if (!object || !isAsWritten || object->Traits() & m_Options.unshared) return false;
    document.object = YAMLMapping::CreateUnbuilt(text, *m_Maker);
    document.object->SetTraits(object->Traits());
    document.isLendable = true;
    return true;
}

void ObjectFile::Read(DocumentReaders& readers, Document& document) const {
    // The parser counts the lines of the file's header in every document.
    const auto read = readers.Trees().Read({document.begin, document.length}, kFileHeaderLines);
    document.object = read.object;
    document.isAsWritten = read.isAsWritten;
}

/// Of objects that were recognised. All are asked for before the first is looked up.
void ObjectFile::InternIDs(std::span<Document> documents) {
    ScalarTable& table = ScalarTable::Instance();
    struct ID {
        std::string_view text;
        std::uint32_t hash;
    };
    std::array<ID, kAtOnce> ids;
    const auto forEach = [&](const auto& visit) {
        for (std::size_t i = 0; i < documents.size(); ++i)
            if (documents[i].object && !documents[i].object->IsBuilt()) visit(documents[i], ids[i]);
    };
    forEach([&](const Document& document, ID& id) {
        const std::string_view text = FileIDOf(document);
        id = {text, ScalarTable::HashOf(text)};
        table.PrefetchSlot(id.hash);
    });
    forEach([&](const Document&, const ID& id) { table.PrefetchScalar(id.hash); });
    forEach([&](Document& document, const ID& id) { document.fileID = table.Intern(id.text, id.hash, 0); });
}

/// What there is to do with an object that the fast reader has read, as long as it is at hand.
void ObjectFile::Complete(Document& document) const {
    YAMLMapping& object = *document.object;
    document.fileID = AsScalar(object.Get(YAMLScalar::fileIDPlaceHolderName));
    if (m_Options.inspect) object.SetTraits(m_Options.inspect(object));
    document.isLendable = !(object.Traits() & m_Options.unshared);
    if (document.isLendable && document.wantedBy) object.MarkAsShared();
    if (!m_Base && document.isAsWritten) object.SetSource({document.begin, document.length});
}

void ObjectFile::Finish() {
    // What comes before a failure points into it as well.
    if (!m_Base && !m_Documents.empty()) m_Objects.KeepText(m_Text);
    m_Objects.KeepMaker(m_Base ? m_Base->m_Maker : m_Maker);
    // A text that ends behind the first marker holds no document.
    if (m_Length <= m_Header.size() + 5) return;
    if (m_Runs.empty())
        Library().ReadRest(m_Header.size());
    else
        FinishDocuments();
    // One of objects that are unbuilt has no hash, as they have none.
    if (!m_Options.recognise) m_Objects.GetMapping().RebuildHash(true);
}

void ObjectFile::FinishDocuments() {
    std::size_t count = 0;
    for (const Run& run : m_Runs) count += run.count;
    m_Objects.GetMapping().Reserve(count);
    std::size_t offset = m_Header.size();
    Pool().With((m_Base ? m_Base : this)->End(), [&](DocumentReaders& readers) {
        for (const Run& run : m_Runs)
            if (!FinishRun(run, readers, offset)) return;
    });
}

/// Adds the objects of a run that begins at `offset`, which becomes that of its end. False if the rest of the
/// file is done, too.
bool ObjectFile::FinishRun(const Run& run, DocumentReaders& readers, std::size_t& offset) {
    // The places of keys in the root lie far from each other in memory: ask for those that come next.
    constexpr std::size_t kAhead = 8;
    YAMLMapping& root = m_Objects.GetMapping();
    const std::span documents(&(run.isLent ? m_Base : this)->m_Documents[run.first], run.count);
    for (std::size_t i = 0; i < documents.size(); offset += documents[i++].length) {
        if (i + kAhead < documents.size()) root.PrefetchKey(documents[i + kAhead].fileID);
        Document document = documents[i];
        if (run.isLent && !document.isLendable) {
            document = {document.begin, document.length};
            ReadDocuments(readers, {&document, 1});
        }
        if (document.object) {
            root.Append(document.fileID, document.object);
        } else {
            NeedWholeText();
            if (!Library().ReadDocument(offset, document.length)) return false;
        }
    }
    return true;
}

LibraryReader ObjectFile::Library() {
    return {*m_Text, m_Header, m_Objects.GetMapping(), m_AliasBudget};
}

} // namespace ovrin_yaml
