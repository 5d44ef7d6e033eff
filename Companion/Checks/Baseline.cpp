#include "Checks/Baseline.h"

#include "Checks/FindingLists.h"
#include "FileUtils.h"
#include "Words/Failure.h"

#include <nlohmann/json.hpp>

namespace ovrin {

Baseline::Baseline(const std::string& path) {
    std::string text;
    if (ReadWholeFile(path, text) != ReadResult::Complete)
        throw Failure("Cannot read the baseline " + path + "; \"ovrin check --json > " + path +
                      "\" makes one");
    try {
        const auto read = nlohmann::json::parse(text);
        for (const auto& finding : read.at("findings")) {
            const auto field = [&](const char* name) { return finding.at(name).get<std::string>(); };
            ++m_Known[{field("code"), field("file"), field("object"), field("detail")}];
            ++m_Left;
        }
    } catch (const nlohmann::json::exception&) {
        throw Failure("The baseline " + path + " isn't what \"ovrin check --json\" writes");
    }
}

void Baseline::Accept(CheckedScene& scene) {
    std::erase_if(scene.findings, [&](const Finding& finding) {
        const auto known = m_Known.find(
            {InfoOf(finding.code).name, AsUtf8(scene.file), AsUtf8(finding.object), AsUtf8(finding.detail)});
        if (known == m_Known.end() || known->second == 0) return false;
        --known->second;
        --m_Left;
        ++m_Accepted;
        return true;
    });
}

} // namespace ovrin
