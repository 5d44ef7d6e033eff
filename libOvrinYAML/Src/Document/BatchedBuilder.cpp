#include "Document/BatchedBuilder.h"

#include "Document/ScalarTable.h"

namespace ovrin_yaml {

BatchedBuilder::Step& BatchedBuilder::Note(Step::What what) {
    if (m_Count == m_Steps.size()) Flush();
    Step& step = m_Steps[m_Count++];
    step.what = what;
    return step;
}

void BatchedBuilder::AddText(std::string_view text) {
    const std::uint32_t hash = ScalarTable::HashOf(text);
    ScalarTable::Instance().PrefetchSlot(hash);
    Step& step = Note(Step::What::Text);
    step.hash = hash;
    step.number = static_cast<std::uint32_t>(text.size());
    step.text = text.data();
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

void BatchedBuilder::CarryOut(const Step& step) {
    switch (step.what) {
    case Step::What::Text:
        m_Builder.AddNode(ScalarTable::Instance().Intern({step.text, step.number}, step.hash, 0));
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
