#include "Settle/Web/ModuleBundle.h"

#include "Words/Failure.h"

#include <algorithm>
#include <cctype>
#include <map>
#include <regex>
#include <vector>

namespace ovrin {

namespace {

/// Whether a line begins with a word, and not with a longer name.
bool BeginsWith(std::string_view line, std::string_view word) {
    if (!line.starts_with(word)) return false;
    const char next = line.size() == word.size() ? ' ' : line[word.size()];
    return !std::isalnum(static_cast<unsigned char>(next)) && next != '_' && next != '$';
}

class Bundle {
public:
    explicit Bundle(std::span<const PageFile> files) : m_Files(files) {}

    /// The name of the constant that holds what the module exports.
    std::string Add(std::string_view name) {
        const auto [found, isNew] = m_Constants.try_emplace(std::string(name));
        if (!isNew) {
            if (found->second.empty()) throw Failure("Module " + std::string(name) + " needs itself");
            return found->second;
        }
        const std::string body = BodyOf(TextOf(name), std::string(name));
        std::string& constant = m_Constants[std::string(name)];
        constant = "module" + std::to_string(++m_Count);
        m_Script += "const " + constant + " = (() => {\n" + body + "})();\n";
        return constant;
    }

    std::string Script() && { return std::move(m_Script); }

private:
    std::string_view TextOf(std::string_view name) const {
        const auto file = std::ranges::find(m_Files, name, &PageFile::name);
        if (file == m_Files.end()) throw Failure("There is no module " + std::string(name));
        return file->bytes;
    }

    /// The text of a module as a function's, after those that it needs were added.
    std::string BodyOf(std::string_view text, const std::string& module) {
        static const std::regex import(R"re(^import (?:(\{[^}]*\}) from )?"\./([^"]+)";)re");
        static const std::regex exported(
            R"re(^export ((?:async )?function\*?|class|const) (\w+)(?![\w$]))re");
        std::string body, exports;
        while (!text.empty()) {
            const std::size_t end = std::min(text.find('\n'), text.size() - 1) + 1;
            std::string line(text.substr(0, end));
            std::size_t taken = end;
            std::smatch match;
            if (BeginsWith(line, "import")) {
                taken = std::min(text.find(';'), text.size() - 1) + 1;
                line = text.substr(0, taken);
                if (!std::regex_search(line, match, import)) TellUnknown(module, line);
                const std::string constant = Add(match[2].str());
                if (match[1].matched)
                    body += "const " + std::regex_replace(match[1].str(), std::regex(" as "), ": ") + " = " +
                            constant + ";";
            } else if (BeginsWith(line, "export")) {
                if (!std::regex_search(line, match, exported)) TellUnknown(module, line);
                exports += (exports.empty() ? " " : ", ") + match[2].str();
                body += line.substr(std::string_view("export ").size());
            } else {
                body += line;
            }
            text.remove_prefix(taken);
        }
        if (!body.ends_with('\n')) body += '\n';
        return body + "return {" + exports + " };\n";
    }

    [[noreturn]] static void TellUnknown(const std::string& module, const std::string& line) {
        throw Failure("Module " + module + " has a form that isn't known: " + line);
    }

    const std::span<const PageFile> m_Files;
    std::map<std::string, std::string> m_Constants; // by the modules; empty as long as one is being added
    std::size_t m_Count = 0;
    std::string m_Script;
};

} // namespace

std::string BundleModules(std::span<const PageFile> files, std::string_view main) {
    Bundle bundle(files);
    bundle.Add(main);
    return std::move(bundle).Script();
}

} // namespace ovrin
