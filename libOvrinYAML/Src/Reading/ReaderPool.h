#pragma once

#include "Reading/Fast/BatchedBuilder.h"
#include "Reading/Fast/Recogniser.h"
#include "Reading/Fast/WrittenFormReader.h"

#include <memory>
#include <mutex>
#include <optional>
#include <utility>
#include <vector>

namespace ovrin_yaml {

/// The fast readers that one thread uses, each made when it is needed: they are big, a small file may do with
/// one, and they read the faster the more they know.
class DocumentReaders {
public:
    using TreeReader = WrittenFormReader<BatchedBuilder>;
    using Recognition = WrittenFormReader<Recogniser>;

    /// From now on documents of a text are read that ends at `end`.
    void SetEnd(const char* end) {
        m_End = end;
        if (m_Trees) m_Trees->SetReadableEnd(end);
        if (m_Recognition) m_Recognition->SetReadableEnd(end);
    }
    TreeReader& Trees() { return m_Trees ? *m_Trees : m_Trees.emplace(m_End); }
    Recognition& Recognisers() { return m_Recognition ? *m_Recognition : m_Recognition.emplace(m_End); }
    void InternTexts() {
        if (m_Trees) m_Trees->InternTexts();
        if (m_Recognition) m_Recognition->InternTexts();
    }

private:
    const char* m_End = nullptr;
    std::optional<TreeReader> m_Trees;
    std::optional<Recognition> m_Recognition;
};

/// Readers that are free at the moment, for any thread.
class ReaderPool {
public:
    /// Calls work(DocumentReaders&) with readers for a text that ends at `end`. If it throws they aren't used
    /// again.
    template <class Work> void With(const char* end, const Work& work) {
        std::unique_ptr<DocumentReaders> readers = Take();
        readers->SetEnd(end);
        work(*readers);
        const std::lock_guard lock(m_Lock);
        m_Idle.push_back(std::move(readers));
    }

private:
    std::unique_ptr<DocumentReaders> Take() {
        const std::lock_guard lock(m_Lock);
        if (m_Idle.empty()) return std::make_unique<DocumentReaders>();
        std::unique_ptr<DocumentReaders> readers = std::move(m_Idle.back());
        m_Idle.pop_back();
        return readers;
    }

    std::mutex m_Lock;
    std::vector<std::unique_ptr<DocumentReaders>> m_Idle;
};

} // namespace ovrin_yaml
