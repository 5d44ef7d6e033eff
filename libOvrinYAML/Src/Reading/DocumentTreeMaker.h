#pragma once

#include "Values/TreeMaker.h"

#include <memory>
#include <string>

namespace ovrin_yaml {

class BatchedBuilder;
template <class Builder> class WrittenFormReader;

/// Builds the trees of objects that were only recognised, with the reader that would have built them.
class DocumentTreeMaker final : public TreeMaker {
public:
    /// Of objects whose bytes stand in `text`.
    explicit DocumentTreeMaker(std::shared_ptr<const std::string> text);
    ~DocumentTreeMaker() override;

private:
    using TreeReader = WrittenFormReader<BatchedBuilder>;

    YAMLMapping* Make(std::string_view source) override;

    const std::shared_ptr<const std::string> m_Text;
    std::unique_ptr<TreeReader> m_Reader; // big, and knows the keys that it met
    bool m_IsAtWork = false;
};

} // namespace ovrin_yaml
