#include "Document/BatchedBuilder.h"

#include "Document/ScalarTable.h"

namespace ovrin_yaml {

BatchedBuilder::Step& BatchedBuilder::Note(Step::What what) {
    if (m_Count == m_Steps.size()) Flush();
    Step& step = m_Steps[m_Count++];
    step.what = what;
    return step;
}

void BatchedBuilder::AddText(std::string_view text, std::size_t readable) {
    const bool isShort = text.size() <= ShortTextCache::kLongest;
    if (isShort) {
        if (YAMLScalar* known = m_ShortTexts.Find(ShortTextCache::Pack(text, readable)))
            return AddScalar(known);
    }
    const std::uint32_t hash = ScalarTable::HashOf(text);
    ScalarTable::Instance().PrefetchSlot(hash);
    Step& step = Note(Step::What::Text);
    step.isShort = isShort;
    step.hash = hash;
    step.number = static_cast<std::uint32_t>(text.size());
    step.text = text.data();
    m_ReadableEnd = text.data() + readable;
}

void BatchedBuilder::AddScalar(YAMLScalar* scalar) {
    Note(Step::What::Scalar).scalar = scalar;
}

void BatchedBuilder::Open(YAMLNode::Kind kind, bool flow, std::uint32_t line) {
    const bool isMapping = kind == YAMLNode::Kind::Mapping;
    Step& step = Note(isMapping ? Step::What::OpenMapping : Step::What::OpenSequence);
    step.flow = flow;
    step.number = line;
}

void BatchedBuilder::Close() {
    Note(Step::What::Close);
}

void BatchedBuilder::Flush() {
    const ScalarTable& table = ScalarTable::Instance();
    for (std::size_t i = 0; i < m_Count; ++i)
        if (m_Steps[i].what == Step::What::Text) table.PrefetchScalar(m_Steps[i].hash);
    for (std::size_t i = 0; i < m_Count; ++i) CarryOut(m_Steps[i]);
    m_Count = 0;
}

YAMLScalar* BatchedBuilder::InternText(const Step& step) {
    const std::string_view text(step.text, step.number);
    YAMLScalar* scalar = ScalarTable::Instance().Intern(text, step.hash, 0);
    if (step.isShort) {
        const auto readable = static_cast<std::size_t>(m_ReadableEnd - step.text);
        m_ShortTexts.Remember(ShortTextCache::Pack(text, readable), scalar);
    }
    return scalar;
}

void BatchedBuilder::CarryOut(const Step& step) {
    switch (step.what) {
    case Step::What::Text:
        m_Builder.AddNode(InternText(step));
        break;
    case Step::What::Scalar:
        m_Builder.AddNode(step.scalar);
        break;
    case Step::What::OpenMapping:
        m_Builder.Open(YAMLNode::Kind::Mapping, step.flow, step.number);
        break;
    case Step::What::OpenSequence:
        m_Builder.Open(YAMLNode::Kind::Sequence, step.flow, step.number);
        break;
    case Step::What::Close:
        m_Builder.Close();
        break;
    }
}

YAMLNode* BatchedBuilder::TakeRoot() {
    Flush();
    return m_Builder.TakeRoot();
}

void BatchedBuilder::Clear() {
    m_Count = 0;
    m_Builder.Clear();
}

} // namespace ovrin_yaml
