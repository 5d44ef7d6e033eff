#include "Reading/DocumentTreeMaker.h"

#include "Reading/Fast/BatchedBuilder.h"
#include "Reading/Fast/WrittenFormReader.h"
#include "Writing/WrittenForm.h"

#include <utility>

namespace ovrin_yaml {

DocumentTreeMaker::DocumentTreeMaker(std::shared_ptr<const std::string> text) : m_Text(std::move(text)) {}

DocumentTreeMaker::~DocumentTreeMaker() = default;

YAMLMapping* DocumentTreeMaker::Make(std::string_view source) {
    // Memory was lacking half-way through the last one.
    if (m_IsAtWork) m_Reader.reset();
    m_IsAtWork = true;
    if (!m_Reader) m_Reader = std::make_unique<TreeReader>(m_Text->data() + m_Text->size());
    YAMLMapping* tree = m_Reader->Read(source, kFileHeaderLines).object;
    m_Reader->InternTexts();
    m_IsAtWork = false;
    return tree;
}

} // namespace ovrin_yaml
