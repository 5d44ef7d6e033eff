#include "Settle/Web/SinglePage.h"

#include "Settle/Web/ModuleBundle.h"
#include "Words/Failure.h"

#include <algorithm>
#include <cctype>
#include <random>

namespace ovrin {

namespace {

std::string_view FileNamed(std::span<const PageFile> files, std::string_view name) {
    const auto file = std::ranges::find(files, name, &PageFile::name);
    if (file == files.end()) throw Failure("The page lacks " + std::string(name));
    return file->bytes;
}

void Replace(std::string& text, std::string_view what, const std::string& by) {
    const std::size_t at = text.find(what);
    if (at == std::string::npos) throw Failure("The page has no " + std::string(what));
    text.replace(at, what.size(), by);
}

/// What stands in an element, whose name has small letters, ends it nowhere.
std::string Inside(const std::string& text, const char* element) {
    std::string small = text;
    for (char& letter : small) letter = static_cast<char>(std::tolower(static_cast<unsigned char>(letter)));
    if (small.find("</" + std::string(element)) != std::string::npos ||
        small.find("<!--") != std::string::npos)
        throw Failure("The page's own files hold what would end the element " + std::string(element));
    return text;
}

/// 128 random bits.
std::string RandomNumber() {
    static constexpr std::string_view kDigits = "0123456789abcdef";
    std::random_device device;
    std::uniform_int_distribution<std::size_t> digit(0, kDigits.size() - 1);
    std::string number;
    for (int i = 0; i < 32; ++i) number += kDigits[digit(device)];
    return number;
}

} // namespace

std::string SafeInScript(std::string_view data) {
    std::string safe;
    safe.reserve(data.size());
    for (std::size_t i = 0; i < data.size(); ++i) {
        const std::string_view rest = data.substr(i);
        if (data[i] == '<') {
            safe += "\\u003c";
        } else if (data[i] == '>') {
            safe += "\\u003e";
        } else if (data[i] == '&') {
            safe += "\\u0026";
        } else if (rest.starts_with("\xE2\x80\xA8") || rest.starts_with("\xE2\x80\xA9")) {
            safe += data[i + 2] == '\xA8' ? "\\u2028" : "\\u2029";
            i += 2;
        } else {
            safe += data[i];
        }
    }
    return safe;
}

std::string SinglePage(std::span<const PageFile> files, std::string_view data) {
    const std::string number = RandomNumber();
    std::string page(FileNamed(files, "index.html"));
    Replace(page, R"(<meta charset="utf-8">)",
            R"(<meta charset="utf-8">
<meta http-equiv="Content-Security-Policy" content="default-src 'none'; script-src 'nonce-)" +
                number + "'; style-src 'nonce-" + number + R"('; base-uri 'none'; form-action 'none'">)");
    Replace(page, "<link rel=\"icon\" href=\"icon.svg\">\n", "");
    Replace(page, R"(<link rel="stylesheet" href="style.css">)",
            "<style nonce=\"" + number + "\">\n" +
                Inside(std::string(FileNamed(files, "style.css")), "style") + "</style>");
    Replace(page, "<script type=\"module\" src=\"main.js\"></script>\n", "");
    // Behind all that the script looks for.
    Replace(page, "</body>",
            "<script type=\"application/json\" id=\"data\">" + SafeInScript(data) +
                "</script>\n<script nonce=\"" + number + "\">\n\"use strict\";\n" +
                Inside(BundleModules(files, "main.js"), "script") + "</script>\n</body>");
    return page;
}

} // namespace ovrin
