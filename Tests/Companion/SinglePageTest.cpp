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

TEST(SinglePage, FilesAreAnsweredByTheirNamesAlone) {
    EXPECT_EQ(AnswerPageFile({"GET", "", {}, ""})->type, "text/html; charset=utf-8");
    EXPECT_EQ(AnswerPageFile({"GET", "main.js", {}, ""})->type, "text/javascript; charset=utf-8");
    EXPECT_FALSE(AnswerPageFile({"POST", "main.js", {}, ""}));
    for (const char* path : {"../main.js", "./main.js", "/etc/passwd", "Page/main.js", "api/session"})
        EXPECT_FALSE(AnswerPageFile({"GET", path, {}, ""})) << path;
}

} // namespace
