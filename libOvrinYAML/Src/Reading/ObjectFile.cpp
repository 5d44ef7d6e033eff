#include "Reading/ObjectFile.h"

#include "Reading/ChunkWalker.h"
#include "Reading/DocumentCut.h"
#include "Reading/DocumentTreeMaker.h"
#include "Reading/Fast/BatchedBuilder.h"
#include "Reading/Fast/Recogniser.h"
#include "Reading/Fast/WrittenFormReader.h"
#include "Values/Arena.h"
#include "Values/ScalarTable.h"
#include "Values/YAMLScalar.h"
#include "Writing/WrittenForm.h"

#include <algorithm>
#include <array>
#include <atomic>
#include <cstring>
#include <optional>
#include <utility>

namespace ovrin_yaml {

namespace {

/// Text that is read at one go: enough for a reader to get to know the common texts, little enough to share
/// out.
constexpr std::size_t kPieceBytes = std::size_t{1} << 20;

} // namespace

/// The readers of one thread, each made when it is needed: they are big, and a small file may do with one.
class ObjectFile::Readers {
public:
    explicit Readers(const char* end) : m_End(end) {}

    TreeReader& Trees() { return m_Trees ? *m_Trees : m_Trees.emplace(m_End); }
    Recognition& Recognisers() { return m_Recognition ? *m_Recognition : m_Recognition.emplace(m_End); }
    void InternTexts() {
        if (m_Trees) m_Trees->InternTexts();
        if (m_Recognition) m_Recognition->InternTexts();
    }

private:
    const char* const m_End;
    std::optional<TreeReader> m_Trees;
    std::optional<Recognition> m_Recognition;
};

std::string_view ObjectFile::FileIDOf(const Document& document) {
    return ovrin_yaml::FileIDOf({document.begin, document.length});
}

void ObjectFile::Take(std::string bytes) {
    if (!HasSignature(bytes))
        throw YAMLError(
            "File is not a valid text serialized YAML file. Make sure that Asset Serialization is "
            "set to 'Force text' in Editor Settings.");
    if (const void* nul = std::memchr(bytes.data(), '\0', bytes.size()))
        bytes.resize(static_cast<std::size_t>(static_cast<const char*>(nul) - bytes.data()));
    TakeText(std::move(bytes));
}

void ObjectFile::TakeText(std::string text) {
    m_Text = std::make_shared<const std::string>(std::move(text));
    m_Length = m_Text->size();
    m_Header = FileHeaderOf(*m_Text);
}

bool ObjectFile::TakeAlong(ByteSource source, ObjectFile& base) {
    if (!MayShareWith(base)) return false;
    TextWindow window(std::move(source));
    // One that begins with the header of another object file has the signature.
    const bool hasItsHeader = window.Reaches(base.m_Header.size() + kDocumentStart.size()) &&
                              window.Rest().starts_with(base.m_Header) &&
                              window.Rest().substr(base.m_Header.size()).starts_with(kDocumentStart);
    if (!hasItsHeader) return false;
    BecomeTakerOf(base);
    CutAlong(base, window);
    return true;
}

void ObjectFile::Cut(ObjectFile* base) {
    if (base) BecomeTakerOf(*base);
    if (!m_Options.fast || !HasWrittenHeader(*m_Text)) return;
    if (base && MayShareWith(*base) && m_Header == base->m_Header) {
        const auto text = m_Text;
        TextWindow window(*text);
        CutAlong(*base, window);
    } else {
        CutAlone();
        if (m_Options.recognise) m_Maker = std::make_shared<DocumentTreeMaker>(m_Text);
    }
}

/// A file that then can't be cut along the base wants none of its documents.
void ObjectFile::BecomeTakerOf(ObjectFile& base) {
    m_TakerBit = static_cast<std::uint8_t>(1u << base.m_TakerCount++);
}

/// Whether documents of a file that is cut may be shared.
bool ObjectFile::MayShareWith(const ObjectFile& base) const {
    return m_Options.fast && m_Options.share && !base.m_Documents.empty();
}

void ObjectFile::CutAlone() {
    constexpr std::size_t kBytesPerDocument = 400;
    ReserveDocuments(m_Text->size() / kBytesPerDocument);
    for (const char* begin = m_Text->data() + m_Header.size(); begin != End();) {
        const char* end = FindDocumentEnd(begin, End());
        AddDocument(begin, static_cast<std::size_t>(end - begin), kNone);
        begin = end;
    }
}

void ObjectFile::ReserveDocuments(std::size_t count) {
    m_Documents.reserve(count);
    AdviseHugePages(m_Documents.data(), count * sizeof(Document));
}

void ObjectFile::AddDocument(const char* begin, std::size_t length, std::size_t lender) {
    m_Documents.push_back({begin, length, lender});
    if (lender == kNone) return;
    // Left and right may want one object at the same time, and say the same.
    std::atomic_ref(m_Base->m_Documents[lender].wantedBy).fetch_or(m_TakerBit, std::memory_order_relaxed);
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
void ObjectFile::CutAlong(ObjectFile& base, TextWindow& window) {
    m_Base = &base;
    const std::vector<Document>& known = base.m_Documents;
    ReserveDocuments(known.size());
    std::string own;
    std::size_t expected = 0;
    for (window.Skip(base.m_Header.size()); window.Reaches(1); window.Skip(m_Documents.back().length)) {
        if (expected < known.size() && StandsAt(known[expected], window)) {
            AddDocument(known[expected].begin, known[expected].length, expected);
            ++expected;
            continue;
        }
        const std::string_view document = window.Document();
        const std::size_t lender = FindLender(document, expected);
        AddDocument(lender == kNone ? nullptr : known[lender].begin, document.size(), lender);
        if (lender == kNone) own += document;
    }
    KeepOwn(std::move(own));
}

/// Takes the texts of the documents that no other file lends, one behind the other.
void ObjectFile::KeepOwn(std::string own) {
    m_Text = std::make_shared<const std::string>(std::move(own));
    m_Header = m_Base->m_Header;
    m_HasWholeText = false;
    m_Length = m_Header.size();
    const char* position = m_Text->data();
    for (Document& document : m_Documents) {
        m_Length += document.length;
        if (document.lender != kNone) continue;
        document.begin = position;
        position += document.length;
    }
}

/// For what goes by the place in the file.
void ObjectFile::NeedWholeText() {
    if (m_HasWholeText) return;
    std::string whole(m_Header);
    whole.reserve(m_Length);
    for (const Document& document : m_Documents) whole.append(document.begin, document.length);
    m_Text = std::make_shared<const std::string>(std::move(whole));
    m_HasWholeText = true;
    const char* position = m_Text->data() + m_Header.size();
    for (Document& document : m_Documents) {
        document.begin = position;
        position += document.length;
    }
}

/// For a document that isn't the expected one; `expected` becomes the one behind the base's of the same id.
std::size_t ObjectFile::FindLender(std::string_view document, std::size_t& expected) const {
    const std::vector<Document>& known = m_Base->m_Documents;
    const std::string_view fileID = ovrin_yaml::FileIDOf(document);
    const bool isChanged = expected < known.size() && FileIDOf(known[expected]) == fileID;
    const std::size_t index = isChanged ? expected : m_Base->IndexOf(fileID);
    if (index == kNone) return kNone;
    expected = index + 1;
    return document == std::string_view(known[index].begin, known[index].length) ? index : kNone;
}

std::size_t ObjectFile::IndexOf(std::string_view fileID) const {
    // Not std::call_once: a lack of memory can't get through the frames of the C library.
    const std::lock_guard lock(m_IndexLock);
    if (m_Index.empty()) {
        m_Index.reserve(m_Documents.size());
        for (std::size_t i = 0; i < m_Documents.size(); ++i) m_Index.try_emplace(FileIDOf(m_Documents[i]), i);
    }
    const auto found = m_Index.find(fileID);
    return found == m_Index.end() ? kNone : found->second;
}

std::size_t ObjectFile::MakePieces() {
    std::size_t bytes = 0, bytesToBuild = 0;
    Piece piece{0, 0};
    for (std::size_t i = 0; i < m_Documents.size(); ++i) {
        const Document& document = m_Documents[i];
        if (document.lender == kNone) bytes += document.length;
        if (document.lender == kNone && !IsWantedByAll(document)) bytesToBuild += document.length;
        piece.end = i + 1;
        if (bytes < kPieceBytes && piece.end != m_Documents.size()) continue;
        m_Pieces.push_back(piece);
        piece = {piece.end, piece.end};
        bytes = 0;
    }
    // A guess that spares the table most of its growing.
    constexpr std::size_t kBytesPerScalar = 56;
    if (!m_Base) ScalarTable::Instance().Reserve(m_Documents.size() + bytesToBuild / kBytesPerScalar);
    return m_Pieces.size();
}

void ObjectFile::ReadPiece(std::size_t piece) {
    Readers readers(End());
    for (std::size_t i = m_Pieces[piece].first; i < m_Pieces[piece].end; i += kAtOnce)
        ReadDocuments(readers, {&m_Documents[i], std::min(kAtOnce, m_Pieces[piece].end - i)});
}

/// Reads those that no other file lends.
void ObjectFile::ReadDocuments(Readers& readers, std::span<Document> documents) const {
    for (Document& document : documents)
        if (document.lender == kNone && !(IsWantedByAll(document) && Recognise(readers, document)))
            Read(readers.Trees(), document);
    readers.InternTexts();
    InternIDs(documents);
    for (Document& document : documents)
        if (document.object && document.object->IsBuilt()) Complete(document);
}

bool ObjectFile::IsWantedByAll(const Document& document) const {
    return m_Maker && m_TakerCount > 0 && document.wantedBy == (1u << m_TakerCount) - 1;
}

/// False for an object whose tree is needed: one that would be written in another way, which goes by the
/// tree, or that nobody may share.
bool ObjectFile::Recognise(Readers& readers, Document& document) const {
    const std::string_view text(document.begin, document.length);
    const auto [object, isAsWritten] = readers.Recognisers().Read(text, kFileHeaderLines);
    if (!object || !isAsWritten || object->Traits() & m_Options.unshared) return false;
    document.object = YAMLMapping::CreateUnbuilt(text, *m_Maker);
    document.object->SetTraitsAsRead(object->Traits());
    document.isLendable = document.isMarked = true;
    return true;
}

void ObjectFile::Read(TreeReader& reader, Document& document) const {
    // The parser counts the lines of the file's header in every document.
    const auto read = reader.Read({document.begin, document.length}, kFileHeaderLines);
    document.object = read.object;
    document.isAsWritten = read.isAsWritten;
}

/// Of objects that were recognised. All are asked for before the first is looked up.
void ObjectFile::InternIDs(std::span<Document> documents) {
    ScalarTable& table = ScalarTable::Instance();
    std::array<std::uint32_t, kAtOnce> hashes;
    const auto forEach = [&](const auto& visit) {
        for (std::size_t i = 0; i < documents.size(); ++i)
            if (documents[i].object && !documents[i].object->IsBuilt()) visit(documents[i], hashes[i]);
    };
    forEach([&](const Document& document, std::uint32_t& hash) {
        hash = ScalarTable::HashOf(FileIDOf(document));
        table.PrefetchSlot(hash);
    });
    forEach([&](const Document&, std::uint32_t hash) { table.PrefetchScalar(hash); });
    forEach([&](Document& document, std::uint32_t hash) {
        document.fileID = table.Intern(FileIDOf(document), hash, 0);
    });
}

/// What there is to do with an object that the fast reader has read, as long as it is at hand.
void ObjectFile::Complete(Document& document) const {
    YAMLMapping& object = *document.object;
    document.fileID = AsScalar(object.Get(YAMLScalar::fileIDPlaceHolderName));
    if (m_Options.inspect) object.SetTraitsAsRead(m_Options.inspect(object));
    document.isLendable = !(object.TraitsAsRead() & m_Options.unshared);
    document.isMarked = document.isLendable && document.wantedBy;
    if (document.isMarked) object.MarkAsShared();
    if (!m_Base && document.isAsWritten) object.SetSource({document.begin, document.length});
}

void ObjectFile::Finish() {
    // What comes before a failure points into it as well.
    if (!m_Base && !m_Documents.empty()) m_Objects.KeepText(m_Text);
    m_Objects.KeepMaker(m_Base ? m_Base->m_Maker : m_Maker);
    // A text that ends behind the first marker holds no document.
    if (m_Length <= m_Header.size() + 5) return;
    if (m_Documents.empty())
        ReadRestByLibrary(m_Header.size());
    else
        FinishDocuments();
    // One of objects that are unbuilt has no hash, as they have none.
    if (!m_Options.recognise) m_Objects.GetMapping().RebuildHash(true);
}

void ObjectFile::FinishDocuments() {
    YAMLMapping& root = m_Objects.GetMapping();
    root.Reserve(m_Documents.size());
    Readers readers(m_Base ? m_Base->End() : End());
    for (Document& document : m_Documents) {
        const Document* lender = document.lender == kNone ? nullptr : &m_Base->m_Documents[document.lender];
        if (lender && lender->isLendable) {
            // Nearly always done by now, while the object was at hand.
            if (!lender->isMarked) lender->object->MarkAsShared();
            root.Append(lender->fileID, lender->object);
            continue;
        }
        if (lender) {
            document.lender = kNone;
            const char* const begin = std::exchange(document.begin, lender->begin);
            ReadDocuments(readers, {&document, 1});
            document.begin = begin;
        }
        if (document.object)
            root.Append(document.fileID, document.object);
        else if (!ReadByLibrary(document, &document == &m_Documents.back()))
            return;
    }
}

/// Reads the next document of a walker that began at `offset`.
bool ObjectFile::ReadNext(ChunkWalker& walker, std::size_t offset) const {
    try {
        return walker.ReadDocument();
    } catch (YAMLError& error) {
        const char* begin = m_Text->data() + std::min(offset + walker.Position(), m_Text->size());
        const auto linesBefore = std::count(m_Text->data(), begin, '\n');
        error.SetPlace(ovrin_yaml::FileIDOf({begin, End()}), static_cast<std::uint32_t>(linesBefore) + 1);
        throw;
    }
}

/// Reads a single document with libyaml. If it doesn't end where the next one begins, all that follows goes
/// the same way, and false is returned.
bool ObjectFile::ReadByLibrary(const Document& document, bool isLast) {
    NeedWholeText();
    const auto offset = static_cast<std::size_t>(document.begin - m_Text->data());
    std::string chunk(m_Header);
    chunk.append(document.begin, document.length);
    if (!isLast) chunk += kDocumentMark;
    ChunkWalker walker(std::move(chunk), std::string(m_Header), m_Objects.GetMapping(), m_AliasBudget);
    if (!ReadNext(walker, offset)) return false;
    if (!isLast && walker.Position() == document.length) return true;
    ReadRestByLibrary(offset + walker.Position());
    return false;
}

/// Reads everything from the document at `offset` on with libyaml.
void ObjectFile::ReadRestByLibrary(std::size_t offset) {
    std::string text(m_Header);
    text.append(*m_Text, offset);
    ChunkWalker walker(std::move(text), std::string(m_Header), m_Objects.GetMapping(), m_AliasBudget);
    while (ReadNext(walker, offset)) {
    }
}

} // namespace ovrin_yaml
