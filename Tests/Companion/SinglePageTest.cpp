#include "Settle/Web/SinglePage.h"

#include "Review/PageRequest.h"
#include "Settle/Web/ModuleBundle.h"
#include "Words/Failure.h"

#include <gtest/gtest.h>

#include <nlohmann/json.hpp>

namespace {

using namespace ovrin;

std::string Bundled(const std::vector<PageFile>& files) {
    try {
        return BundleModules(files, "main.js");
    } catch (const Failure& failure) {
        return failure.what();
    }
}

PageFile Module(std::string_view name, std::string_view text) {
    return {name, "text/javascript", text};
}

TEST(ModuleBundle, ModulesBecomeFunctionsInTheOrderOfTheirNeeds) {
    EXPECT_EQ(
        Bundled({Module("main.js", "import { a, b as c } from \"./two.js\";\nimport \"./one.js\";\na(c);\n"),
                 Module("one.js", "const x = 1;"),
                 Module("two.js", "import {\n  d,\n} from \"./one.js\";\nexport function a(v) {}\n"
                                  "  export_me();\nexport const b = 1;\n")}),
        "const module1 = (() => {\nconst x = 1;\nreturn { };\n})();\n"
        "const module2 = (() => {\nconst {\n  d,\n} = module1;\nfunction a(v) {}\n  export_me();\n"
        "const b = 1;\nreturn { a, b };\n})();\n"
        "const module3 = (() => {\nconst { a, b: c } = module2;\n\na(c);\nreturn { };\n})();\n");
}

TEST(ModuleBundle, WhatIsNoKnownFormIsRefused) {
    EXPECT_EQ(Bundled({}), "There is no module main.js");
    EXPECT_EQ(Bundled({Module("main.js", "import \"./main.js\";\n")}), "Module main.js needs itself");
    for (const char* text : {"import all from \"./b.js\";", "export default 1;", "export { a };",
                             "import { a } from \"https://b.js\";", "import { a } from \"./b.js\""})
        EXPECT_NE(Bundled({Module("main.js", text), Module("b.js", "")}).find("form that isn't known"),
                  std::string::npos)
            << text;
}

TEST(ModuleBundle, FormsAreKnownHoweverTheyAreSpaced) {
    for (const char* text :
         {"import{ a } from \"./b.js\";", "import* as b from \"./b.js\";", "import'./b.js';",
          "import(\"./b.js\");", "import.meta.url;", "import\t{ a } from \"./b.js\";",
          "import\n{ a } from \"./b.js\";", "export* from \"./b.js\";", "export{ a };",
          "export\tconst a = 1;", "export let a = 1;", "export const $ = 1;", "export const a$ = 1;",
          "export const { a } = b;", "export"})
        EXPECT_NE(Bundled({Module("main.js", text), Module("b.js", "")}).find("form that isn't known"),
                  std::string::npos)
            << text;
    for (const char* text : {"imported();\n", "exports.a = 1;\n", "import_();\n", "export$();\n", "", "\n"})
        EXPECT_EQ(Bundled({Module("main.js", text)}),
                  "const module1 = (() => {\n" + std::string(*text ? text : "\n") + "return { };\n})();\n");
}

TEST(ModuleBundle, ModulesInARingAreTold) {
    EXPECT_EQ(Bundled({Module("main.js", "import \"./a.js\";\n"), Module("a.js", "import \"./b.js\";\n"),
                       Module("b.js", "import \"./a.js\";\n")}),
              "Module a.js needs itself");
    EXPECT_EQ(Bundled({Module("main.js", "import \"./a.js\";\n")}), "There is no module a.js");
}

/// What a file of the page holds; nothing if there is none.
std::string BytesOf(const std::string& name) {
    for (const PageFile& file : PageFiles())
        if (file.name == name) return std::string(file.bytes);
    return "";
}

/// The files of a page with one in place of its own.
std::vector<PageFile> FilesWith(std::string_view name, std::string_view bytes) {
    std::vector<PageFile> files(PageFiles().begin(), PageFiles().end());
    for (PageFile& file : files)
        if (file.name == name) file.bytes = bytes;
    return files;
}

TEST(SinglePage, FilesThatWouldEndTheirElementAreRefused) {
    for (const char* text : {"/* </style> */", "/* </STYLE\n> */", "/* </sTyLe */", "/* <!-- */"})
        EXPECT_THROW(SinglePage(FilesWith("style.css", text), "{}"), Failure) << text;
    for (const char* text : {"a = '</script>';", "a = '</SCRIPT >';", "a = '</Script';", "// <!--<script>"})
        EXPECT_THROW(SinglePage(FilesWith("main.js", text), "{}"), Failure) << text;
    EXPECT_NO_THROW(SinglePage(FilesWith("main.js", "a = '<\\/script>' < /style/;"), "{}"));
}

TEST(SinglePage, PageWithoutItsPlacesIsNone) {
    const std::string page = BytesOf("index.html");
    for (const char* place : {"<meta charset=\"utf-8\">", "<link rel=\"icon\"", "<link rel=\"stylesheet\"",
                              "<script type=\"module\"", "</body>"}) {
        std::string without = page;
        without.replace(without.find(place), 2, "x");
        EXPECT_THROW(SinglePage(FilesWith("index.html", without), "{}"), Failure) << place;
    }
    EXPECT_THROW(SinglePage({}, "{}"), Failure);
}

TEST(SinglePage, DataComesBackAsItWas) {
    std::string text;
    for (int letter = 1; letter < 128; ++letter) text += static_cast<char>(letter);
    for (const char* more : {"\xE2\x80\xA8", "\xE2\x80\xA9", "\xE2\x80\xA7", "\xE2\x80\xAE", "\xE2\x80\xAA",
                             "\xF0\x9F\x8F\xAE", "</body>", "<!--<script>", "]]>", "&lt;"})
        text += more;
    const nlohmann::json data = {{text, {text, {{"</script>", 1}}}}};
    EXPECT_EQ(nlohmann::json::parse(SafeInScript(JsonText(data))), data);
    for (const char* cut : {"\xE2", "\xE2\x80", ""}) EXPECT_EQ(SafeInScript(cut), cut);
}

TEST(SinglePage, NothingInTheDataIsMarkup) {
    const std::string hostile =
        "</script><script>alert(1)</script><!--&amp;\xE2\x80\xA8\xE2\x80\xA9\xE2\x80\xA6\xFF\\";
    const std::string page = SinglePage(PageFiles(), JsonText({{"name", hostile}}));
    const std::size_t begin = page.find("id=\"data\">") + 10;
    const std::string data = page.substr(begin, page.find("</script>", begin) - begin);
    EXPECT_EQ(data.find_first_of("<>&"), std::string::npos);
    EXPECT_EQ(data.find("\xE2\x80\xA8"), std::string::npos);
    EXPECT_EQ(nlohmann::json::parse(data)["name"], hostile.substr(0, hostile.size() - 2) + "\xEF\xBF\xBD\\");
}

TEST(SinglePage, TheFileAsksForNothing) {
    const std::string page = SinglePage(PageFiles(), "{}"), other = SinglePage(PageFiles(), "{}");
    const auto count = [&](const std::string& text) {
        std::size_t found = 0;
        for (std::size_t at = page.find(text); at != std::string::npos; at = page.find(text, at + 1)) ++found;
        return found;
    };
    EXPECT_EQ(count("<script"), 2);
    EXPECT_EQ(count("</script"), 2);
    EXPECT_EQ(count("<style nonce="), 1);
    for (const char* foreign :
         {"<link", " src=", "type=\"module\"", "\nimport ", "\nexport ", "unsafe", "url("})
        EXPECT_EQ(count(foreign), 0) << foreign;
    EXPECT_NE(page.find("default-src 'none'; script-src 'nonce-"), std::string::npos);
    EXPECT_NE(page, other);
}

TEST(SinglePage, EveryFileThatThePageNamesIsThere) {
    const std::string page = BytesOf("index.html");
    std::size_t named = 0;
    for (const std::string place : {"href=\"", "src=\""})
        for (std::size_t at = page.find(place); at != std::string::npos; at = page.find(place, at + 1)) {
            const std::size_t begin = at + place.size();
            const std::string name = page.substr(begin, page.find('"', begin) - begin);
            EXPECT_TRUE(name.starts_with('#') || !BytesOf(name).empty()) << name;
            ++named;
        }
    EXPECT_GE(named, 3);
}

TEST(SinglePage, FilesAreAnsweredByTheirNamesAlone) {
    EXPECT_EQ(AnswerPageFile({"GET", "", {}, ""})->type, "text/html; charset=utf-8");
    EXPECT_EQ(AnswerPageFile({"GET", "main.js", {}, ""})->type, "text/javascript; charset=utf-8");
    EXPECT_FALSE(AnswerPageFile({"POST", "main.js", {}, ""}));
    for (const char* path : {"../main.js", "./main.js", "/etc/passwd", "Page/main.js", "api/session"})
        EXPECT_FALSE(AnswerPageFile({"GET", path, {}, ""})) << path;
}

} // namespace
