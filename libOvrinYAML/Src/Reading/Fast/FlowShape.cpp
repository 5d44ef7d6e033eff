#include "Reading/Fast/FlowShape.h"

#include <algorithm>

namespace ovrin_yaml {

FlowShape FlowShape::Of(std::string_view mapping) {
    constexpr std::string_view kBehindKey = ": ";
    FlowShape shape;
    while (!mapping.starts_with('}')) {
        const std::size_t key = mapping.find(kBehindKey);
        if (key == std::string_view::npos || shape.m_PartCount == kMostPairs) return {};
        const std::string_view part = mapping.substr(0, key + kBehindKey.size());
        if (part.ends_with("{fileID: ") || part.ends_with(", fileID: "))
            shape.m_FileIDPair = shape.m_PartCount;
        if (!shape.AddPart(part)) return {};
        mapping.remove_prefix(part.size());
        const auto isMore = [](char c) { return c == '{' || c == '[' || c == '\'' || c == '"'; };
        const auto end = std::find_if(mapping.begin(), mapping.end(),
                                      [&](char c) { return c == ',' || c == '}' || isMore(c); });
        if (end == mapping.end() || isMore(*end)) return {};
        mapping.remove_prefix(static_cast<std::size_t>(end - mapping.begin()));
    }
    shape.m_Count = shape.m_PartCount;
    shape.AddPart(mapping);
    return shape;
}

bool FlowShape::AddPart(std::string_view text) {
    Part& part = m_Parts[m_PartCount++];
    if (text.size() > sizeof part.words) return false;
    char mask[sizeof part.masks] = {};
    std::memset(mask, 0xff, text.size());
    std::memcpy(part.words, text.data(), text.size());
    std::memcpy(part.masks, mask, sizeof mask);
    part.length = text.size();
    return true;
}

} // namespace ovrin_yaml
