#pragma once

#include "ErrorOf.h"
#include "Reading/ObjectFileReader.h"
#include "Values/OvrinObjects.h"
#include "Values/YAMLScalar.h"
#include "Writing/CheckTree.h"
#include "Writing/ObjectFileWriter.h"

#include <gtest/gtest.h>

#include <sstream>
#include <string>
#include <string_view>

/// Object files as lines, one object each: class id, file id, and the body in flow style.
///
///     4 &12 Transform: {m_Father: {fileID: 0}}
///     4 &13 stripped Transform: {}
namespace object_text {

using namespace ovrin_yaml;
using failures::ErrorOf;

inline const YAMLScalar* Id(std::string_view text) {
    return YAMLScalar::Lookup(text);
}

/// A file of these objects, read as a file is.
class Scene {
public:
    Scene(const char* lines) : Scene(std::string(lines)) {}
    Scene(const std::string& lines) {
        initialize();
        std::string text = "%YAML 1.1\n%TAG !o! tag:test,2011:\n";
        std::istringstream stream(lines);
        for (std::string classID, rest; stream >> classID && std::getline(stream >> std::ws, rest);) {
            const std::size_t body = rest.find(' ', rest.find(" stripped ") + 1);
            text += "--- !o!" + classID + " " + rest.substr(0, body) + "\n" + rest.substr(body + 1) + "\n";
        }
        ParseYAMLString(text, m_Objects);
        EXPECT_EQ(CheckTree(Root(), TreeStage::Hashed), "");
    }

    OvrinObjects& Objects() { return m_Objects; }
    YAMLMapping& Root() { return m_Objects.GetMapping(); }
    YAMLMapping& Object(std::string_view id) { return ToMapping(Root().GetRef(Id(id))); }

    /// The lines of the file as it is now, each with its line break. Folded bodies are unfolded.
    std::string Text() const {
        EXPECT_EQ(CheckTree(m_Objects.GetMapping(), TreeStage::Changed), "");
        std::ostringstream stream;
        Output(m_Objects, stream);
        std::istringstream written(stream.str());
        std::string text;
        for (std::string line; std::getline(written, line);) {
            if (line.starts_with('%')) continue;
            const bool opens = text.ends_with('{') || text.ends_with('[');
            if (line.starts_with("--- !o!"))
                text += (text.empty() ? "" : "\n") + line.substr(7);
            else
                text += (opens ? "" : " ") + line.substr(line.find_first_not_of(' '));
        }
        return text.empty() ? text : text + '\n';
    }

private:
    OvrinObjects m_Objects;
};

} // namespace object_text
