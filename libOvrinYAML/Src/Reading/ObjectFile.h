#pragma once

#include "Reading/DocumentIndex.h"
#include "Reading/DocumentLoader.h"
#include "Reading/PartReading.h"
#include "Reading/ReaderOptions.h"
#include "Reading/TextWindow.h"
#include "Values/Arena.h"
#include "Values/OvrinObjects.h"

#include <cstddef>
#include <cstdint>
#include <memory>
#include <mutex>
#include <span>
#include <string>
#include <string_view>
#include <vector>

namespace ovrin_yaml {

class DocumentReaders;
class LibraryReader;
class ReaderPool;

/// An object file on its way from text to objects.
///
///  1. `Take` tests the signature, and `Cut` cuts the text at the document headers. A file that is cut along
///     another finds that one's documents in it: what stands there in the same words needs no reading.
///     Several files may be cut along one at the same time.
///  2. `MakePieces`, when all files are cut, tells how many pieces there are, and `ReadPiece` reads the
///     documents of one that are in written form. Pieces are independent of each other: any thread may read
///     any piece, each once. With ReaderOptions::recognise what all files have is only recognised.
///  3. `Finish` adds the objects to the root in file order. A document that the fast reader wasn't sure of
///     goes to libyaml here, so that the first failure in file order is the one that is thrown.
///
/// A text whose header hasn't the usual form goes to libyaml as a whole (ChunkWalker), and so does the rest
/// of a text behind a document that doesn't end where the next header stands.
///
/// Sharing: an object that a second file takes is marked, and whoever changes it copies it first
/// (YAMLMapping::GetForChange). Objects with repeated keys are left to libyaml and are not shared. Only the
/// file that others are cut along keeps its text, with the objects that are in written form pointing into it:
/// what nobody changes is written as the bytes that came in.
class ObjectFile {
public:
    /// Fills `objects`, which must be empty and outlive the file.
    ObjectFile(OvrinObjects& objects, ReaderOptions options);
    ~ObjectFile();
    ObjectFile(const ObjectFile&) = delete;
    ObjectFile& operator=(const ObjectFile&) = delete;

    /// Takes the bytes of a whole file, up to the first NUL. Throws YAMLError for a file without the
    /// signature.
    void Take(std::string bytes);
    /// The same of one in which it is known where the documents begin.
    void TakeCut(CutText text);
    /// The same for a text that needs no signature.
    void TakeText(std::string text);
    /// Takes a file, of `size` bytes as far as is known, and cuts it along `base`, as below, without ever
    /// having it all in memory. False, with nothing done, for a file that hasn't the base's header or isn't
    /// to share anything.
    bool TakeAlong(ByteSource source, std::size_t size, ObjectFile& base);
    /// Cuts the text, along `base` if it is not null; that must be cut already and stay where it is. Objects
    /// that are wanted before they are read are marked as shared while they are at hand.
    void Cut(ObjectFile* base);
    /// Cuts what is to be read into pieces, once, when all files are cut. Returns their number.
    std::size_t MakePieces();
    void ReadPiece(std::size_t piece);
    /// All pieces must have been read, those of the base too. Throws YAMLError.
    void Finish();

private:
    struct Document {
        const char* begin;
        std::size_t length;
        YAMLMapping* object = nullptr; // null: not read, or left to libyaml
        YAMLScalar* fileID = nullptr;  // of the object
        std::uint8_t wantedBy = 0;     // files that would take the object, a bit each
        bool isLendable = false; // the object may be copied before a change, so another file may take it
        bool isAsWritten = false;
    };
    using DocumentList = std::vector<Document, HugePageAllocator<Document>>;
    /// Documents that stand one behind the other, in this file and in m_Documents, its own or the base's.
    struct Run {
        std::size_t first, count;
        bool isLent; // by the base, which has them in the same words
    };
    struct Piece {
        std::size_t first, end; // documents of its own
    };
    static constexpr std::size_t kNone = DocumentIndex::kMissing;
    static constexpr std::size_t kAtOnce = 32; // documents

    static std::string_view FileIDOf(const Document& document);
    static std::string_view UsualIDOf(const Document& document);
    const char* End() const { return m_Text->data() + m_Text->size(); }
    void BecomeTakerOf(ObjectFile& base);
    bool MayShareWith(const ObjectFile& base) const;
    static bool StandsAt(const Document& document, TextWindow& window);
    std::size_t FindLender(std::string_view document, std::size_t& expected);
    std::size_t FindInBase(std::string_view fileID, std::size_t expected);
    std::size_t IndexOf(std::string_view fileID) const;
    void CutAlong(ObjectFile& base, TextWindow& window, std::size_t size);
    void AddToRun(std::size_t document, bool isLent);
    void KeepOwn(std::string own);
    void NeedWholeText();
    template <class Visit> void ForEachRun(const Visit& visit) const;
    void CutAlone();
    void NoteWants();
    ReaderPool& Pool();
    void ReadDocuments(DocumentReaders& readers, std::span<Document> documents) const;
    bool IsWantedByAll(const Document& document) const;
    bool Recognise(DocumentReaders& readers, Document& document) const;
    void Read(DocumentReaders& readers, Document& document) const;
    static void InternIDs(std::span<Document> documents);
    void Complete(Document& document) const;
    void FinishDocuments();
    bool FinishRun(const Run& run, DocumentReaders& readers, std::size_t& offset);
    LibraryReader Library();

    OvrinObjects& m_Objects;
    const ReaderOptions m_Options;
    ObjectFile* m_Base = nullptr;
    std::mutex m_TakersLock;
    std::vector<const ObjectFile*> m_Takers;   // files to be cut along this one
    std::shared_ptr<const std::string> m_Text; // the documents of its own alone, or the whole
    std::size_t m_Length = 0;                  // of the whole
    bool m_HasWholeText = true;
    std::shared_ptr<TreeMaker> m_Maker; // of the objects that are only recognised
    std::string_view m_Header;
    std::vector<std::size_t> m_Starts; // of documents in the text, but for the first, where they are known
    DocumentList m_Documents;          // its own
    std::vector<Run> m_Runs;           // empty: libyaml reads all of the text
    std::size_t m_UnfoundCount = 0;    // documents taken for new without a search in all of the base
    std::vector<Piece> m_Pieces;
    const std::unique_ptr<ReaderPool> m_Pool; // for this file and its takers
    AliasBudget m_AliasBudget;

    // For the files that are cut along this one; made by the first that asks.
    mutable std::mutex m_IndexLock;
    mutable DocumentIndex m_Index;
};

} // namespace ovrin_yaml
