#include "Conflicts/DecisionPath.h"

namespace ovrin {

using ovrin_yaml::Path;
using ovrin_yaml::YAMLScalar;

std::string DecisionPath(std::span<const YAMLScalar* const> path) {
    std::string text;
    for (std::size_t i = 0; i < path.size(); ++i) {
        if (i > 0) text += '.';
        for (const char character : path[i]->Value()) {
            if (character == '.' || character == '\\') text += '\\';
            text += character;
        }
    }
    return text;
}

Path PathOfDecision(std::string_view text) {
    Path path;
    std::string element;
    for (std::size_t i = 0; i < text.size(); ++i) {
        if (text[i] == '.') {
            path.push_back(YAMLScalar::Lookup(element));
            element.clear();
        } else {
            if (text[i] == '\\' && i + 1 < text.size()) ++i;
            element += text[i];
        }
    }
    path.push_back(YAMLScalar::Lookup(element));
    return path;
}

} // namespace ovrin
