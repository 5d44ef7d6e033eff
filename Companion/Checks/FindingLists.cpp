#include "Checks/FindingLists.h"

#include "Names/PrintableText.h"

#include <nlohmann/json.hpp>
#include <string_view>

namespace ovrin {

using nlohmann::json;

namespace {

const char* NameOf(Severity severity) {
    return severity == Severity::Error ? "error" : "warning";
}

std::string SubjectOf(const Finding& finding) {
    if (finding.object.empty()) return "";
    return finding.name.empty() ? "object " + finding.object : finding.name + " (" + finding.object + ")";
}

/// The sentence that a finding is.
std::string SentenceOf(const Finding& finding) {
    const std::string subject = SubjectOf(finding);
    return subject.empty() ? finding.message : subject + ": " + finding.message;
}

std::string Dump(const json& value) {
    return value.dump(2, ' ', false, json::error_handler_t::replace) + '\n';
}

json FindingJson(const CheckedScene& scene, const Finding& finding) {
    const CodeInfo& info = InfoOf(finding.code);
    return {{"code", info.name},
            {"severity", NameOf(info.severity)},
            {"file", AsUtf8(scene.file)},
            {"line", finding.line},
            {"object", AsUtf8(finding.object)},
            {"name", AsUtf8(finding.name)},
            {"detail", AsUtf8(finding.detail)},
            {"message", AsUtf8(finding.message)}};
}

/// A path as a reference of a URI: a first folder with a colon would be taken for a scheme.
std::string ToUri(const std::string& path) {
    constexpr std::string_view kUnreserved = "-._~/";
    std::string uri;
    for (const char c : path) {
        const auto byte = static_cast<unsigned char>(c);
        const bool isLetter = (c >= 'a' && c <= 'z') || (c >= 'A' && c <= 'Z');
        if (isLetter || (c >= '0' && c <= '9') || kUnreserved.find(c) != kUnreserved.npos)
            uri += c;
        else
            uri.append({'%', "0123456789ABCDEF"[byte >> 4], "0123456789ABCDEF"[byte & 15]});
    }
    return path.starts_with('/') ? "file://" + uri : uri;
}

json SarifRule(const CodeInfo& info) {
    return {{"id", info.name},
            {"shortDescription", {{"text", info.title}}},
            {"fullDescription", {{"text", info.explanation}}},
            {"defaultConfiguration", {{"level", NameOf(info.severity)}}}};
}

json SarifLocation(const CheckedScene& scene, const Finding& finding) {
    json place = {{"artifactLocation", {{"uri", ToUri(scene.file)}}}};
    if (finding.line) place["region"] = {{"startLine", finding.line}};
    json location = {{"physicalLocation", place}};
    const std::string subject = SubjectOf(finding);
    if (!subject.empty()) location["logicalLocations"] = {{{"fullyQualifiedName", AsUtf8(subject)}}};
    return location;
}

json SarifResult(const CheckedScene& scene, const Finding& finding) {
    const CodeInfo& info = InfoOf(finding.code);
    const std::string identity = finding.object + ' ' + finding.detail;
    return {{"ruleId", info.name},
            {"ruleIndex", static_cast<std::size_t>(info.code)},
            {"level", NameOf(info.severity)},
            {"message", {{"text", AsUtf8(SentenceOf(finding))}}},
            {"locations", json::array({SarifLocation(scene, finding)})},
            {"partialFingerprints", {{"objectAndDetail/v1", AsUtf8(identity)}}}};
}

} // namespace

std::string AsUtf8(const std::string& text) {
    try {
        (void)json(text).dump();
        return text;
    } catch (const json::type_error&) {
        return Printable(text);
    }
}

std::string ToLines(const CheckedScenes& result) {
    std::string lines;
    for (const CheckedScene& scene : result.scenes) {
        for (const Finding& finding : scene.findings) {
            const CodeInfo& info = InfoOf(finding.code);
            lines += Printable(scene.file) + ':';
            if (finding.line) lines += std::to_string(finding.line) + ':';
            lines += std::string(" ") + NameOf(info.severity) + ": " + Printable(SentenceOf(finding)) + " [" +
                     info.name + "]\n";
        }
    }
    return lines;
}

std::string ToJson(const CheckedScenes& result) {
    json findings = json::array(), failures = json::array();
    for (const CheckedScene& scene : result.scenes) {
        for (const Finding& finding : scene.findings) findings.push_back(FindingJson(scene, finding));
        if (!scene.failure.empty())
            failures.push_back({{"file", AsUtf8(scene.file)}, {"message", AsUtf8(scene.failure)}});
    }
    return Dump({{"version", 1},
                 {"checked", result.checked},
                 {"accepted", result.accepted},
                 {"findings", findings},
                 {"failures", failures}});
}

std::string ToSarif(const CheckedScenes& result) {
    json rules = json::array(), results = json::array(), notifications = json::array();
    for (const CodeInfo& info : CodeTable()) rules.push_back(SarifRule(info));
    for (const CheckedScene& scene : result.scenes) {
        for (const Finding& finding : scene.findings) results.push_back(SarifResult(scene, finding));
        if (!scene.failure.empty())
            notifications.push_back({{"level", "error"}, {"message", {{"text", AsUtf8(scene.failure)}}}});
    }
    const json invocation = {{"executionSuccessful", notifications.empty()},
                             {"toolExecutionNotifications", notifications}};
    const json driver = {{"name", "ovrin"}, {"version", OVRIN_VERSION}, {"rules", rules}};
    return Dump({{"version", "2.1.0"},
                 {"$schema", "https://json.schemastore.org/sarif-2.1.0.json"},
                 {"runs", json::array({{{"tool", {{"driver", driver}}},
                                        {"columnKind", "unicodeCodePoints"},
                                        {"invocations", json::array({invocation})},
                                        {"results", results}}})}});
}

} // namespace ovrin
