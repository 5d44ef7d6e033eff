#pragma once

#include <mutex>
#include <string_view>

namespace ovrin_yaml {

class YAMLMapping;

/// Makes the trees of objects that are unbuilt (YAMLMapping::CreateUnbuilt), of which any thread may ask.
class TreeMaker {
public:
    TreeMaker() = default;
    TreeMaker(const TreeMaker&) = delete;
    TreeMaker& operator=(const TreeMaker&) = delete;
    virtual ~TreeMaker() = default;

private:
    friend class YAMLMapping;

    /// The tree of the object that has these bytes, which nobody else gets. Called under the lock.
    virtual YAMLMapping* Make(std::string_view source) = 0;

    std::mutex m_Lock;
};

} // namespace ovrin_yaml
