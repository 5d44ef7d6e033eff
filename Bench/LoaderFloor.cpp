// libyaml's document loader alone over object files: the floor that the tool's reading is compared with. Each
// document gets a parser of its own and nothing is kept. Prints nothing.
//
//   LoaderFloor [--nothreads] FILE...

#include <yaml.h>

#include <exception>
#include <fstream>
#include <iostream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <thread>
#include <vector>

namespace {

void LoadDocument(std::string_view text) {
    yaml_parser_t parser;
    yaml_document_t document;
    yaml_parser_initialize(&parser);
    yaml_parser_set_input_string(&parser, reinterpret_cast<const unsigned char*>(text.data()), text.size());
    if (!yaml_parser_load(&parser, &document)) {
        std::string problem = parser.problem ? parser.problem : "unknown problem";
        yaml_parser_delete(&parser);
        throw std::runtime_error(problem);
    }
    yaml_document_delete(&document);
    yaml_parser_delete(&parser);
}

/// The parser doesn't know the word behind the id.
void BlankStripped(std::string& text, std::size_t headerLine) {
    constexpr std::string_view word = " stripped";
    std::size_t end = text.find('\n', headerLine);
    if (end == std::string::npos || end < headerLine + word.size()) return;
    if (text.compare(end - word.size(), word.size(), word) == 0)
        text.replace(end - word.size(), word.size(), word.size(), ' ');
}

void LoadDocuments(std::string text) {
    constexpr std::string_view separator = "\n--- !o!";
    std::size_t start = text.find("---");
    std::string chunk = text.substr(0, start);
    const std::size_t headerLength = chunk.size();
    while (start < text.size()) {
        std::size_t next = text.find(separator, start);
        std::size_t end = next == std::string::npos ? text.size() : next + 1;
        chunk.resize(headerLength);
        chunk.append(text, start, end - start);
        BlankStripped(chunk, headerLength);
        LoadDocument(chunk);
        start = end;
    }
}

void LoadFile(const std::string& path) {
    std::ifstream file(path, std::ios::binary);
    if (!file) throw std::runtime_error("Cannot open file");
    file.seekg(0, std::ios::end);
    std::string text(static_cast<std::size_t>(file.tellg()), '\0');
    file.seekg(0);
    file.read(text.data(), static_cast<std::streamsize>(text.size()));
    LoadDocuments(std::move(text));
}

/// Loads a file and keeps what went wrong.
void TryFile(const std::string& path, std::string& error) {
    try {
        LoadFile(path);
    } catch (const std::exception& caught) {
        error = path + ": " + caught.what();
    }
}

} // namespace

int main(int count, char** words) {
    std::vector<std::string> paths(words + 1, words + count);
    bool useThreads = std::erase(paths, "--nothreads") == 0;
    std::vector<std::string> errors(paths.size());
    std::vector<std::thread> threads;
    for (std::size_t i = 0; i < paths.size(); ++i) {
        if (useThreads)
            threads.emplace_back(TryFile, std::cref(paths[i]), std::ref(errors[i]));
        else
            TryFile(paths[i], errors[i]);
    }
    for (std::thread& thread : threads) thread.join();
    int status = 0;
    for (const std::string& error : errors) {
        if (error.empty()) continue;
        std::cerr << error << '\n';
        status = 1;
    }
    return status;
}
