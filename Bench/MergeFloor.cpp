// What no merge can do without: reads three object files, cuts left and right along the base, compares their
// documents, and writes those of the base, or of the side that has another one, twice: into a temporary file
// and from there to the destination. It looks at no byte inside a document but to compare it. Prints nothing.
//
//   MergeFloor BASE LEFT RIGHT DESTINATION

#include <algorithm>
#include <cstring>
#include <exception>
#include <fcntl.h>
#include <iostream>
#include <stdexcept>
#include <string>
#include <string_view>
#include <sys/stat.h>
#include <unistd.h>
#include <unordered_map>
#include <vector>

namespace {

using Texts = std::vector<std::string_view>;

constexpr std::string_view kNextDocument = "\n--- !o!";

void Check(bool holds, const std::string& fault) {
    if (!holds) throw std::runtime_error(fault);
}

std::string ReadFile(const std::string& path) {
    const int file = open(path.c_str(), O_RDONLY | O_CLOEXEC);
    struct stat status {};
    Check(file >= 0 && fstat(file, &status) == 0, "Cannot open " + path);
    const auto size = static_cast<std::size_t>(status.st_size);
    std::string text;
    text.resize_and_overwrite(size, [&](char* bytes, std::size_t) {
        std::size_t at = 0;
        for (ssize_t count = 1; at < size && count > 0; at += static_cast<std::size_t>(count))
            count = std::max<ssize_t>(read(file, bytes + at, size - at), 0);
        return at;
    });
    close(file);
    Check(text.size() == size, "Cannot read " + path);
    return text;
}

/// Looks for a sign of the next document's header that is seldom elsewhere.
std::string_view DocumentAt(std::string_view text) {
    constexpr std::size_t kSignAt = kNextDocument.find('!');
    for (std::size_t sign = kNextDocument.size(); (sign = text.find('!', sign)) != std::string_view::npos;
         ++sign)
        if (text.substr(sign - kSignAt).starts_with(kNextDocument)) return text.substr(0, sign - kSignAt + 1);
    return text;
}

/// The header line, which tells a document's class and id.
std::string_view HeaderOf(std::string_view document) {
    return document.substr(0, document.find('\n'));
}

std::string_view WithoutFileHeader(std::string_view text) {
    return text.substr(text.find("---"));
}

Texts Cut(std::string_view text) {
    Texts documents;
    for (; !text.empty(); text.remove_prefix(documents.back().size())) documents.push_back(DocumentAt(text));
    return documents;
}

/// Puts what a side has in other words into `result`, in the place of the base's or behind all.
void TakeChanges(const Texts& base, std::string_view side, Texts& result) {
    std::unordered_map<std::string_view, std::size_t> places;
    std::size_t expected = 0;
    while (!side.empty()) {
        if (expected < base.size() && side.starts_with(base[expected])) {
            side.remove_prefix(base[expected++].size());
            continue;
        }
        const std::string_view document = DocumentAt(side);
        if (places.empty())
            for (std::size_t i = 0; i < base.size(); ++i) places.emplace(HeaderOf(base[i]), i);
        const auto place = places.find(HeaderOf(document));
        if (place == places.end()) {
            result.push_back(document);
        } else {
            if (base[place->second] != document) result[place->second] = document;
            expected = place->second + 1;
        }
        side.remove_prefix(document.size());
    }
}

void Write(int file, const std::string& bytes) {
    for (std::size_t at = 0; at < bytes.size();) {
        const ssize_t count = write(file, bytes.data() + at, bytes.size() - at);
        Check(count > 0, "Cannot write");
        at += static_cast<std::size_t>(count);
    }
}

void WriteDocuments(int file, std::string_view header, const Texts& documents) {
    constexpr std::size_t kPiece = std::size_t{1} << 20;
    std::string piece(header);
    for (const std::string_view document : documents) {
        piece += document;
        if (piece.size() < kPiece) continue;
        Write(file, piece);
        piece.clear();
    }
    Write(file, piece);
}

void Copy(int from, int to) {
    std::string piece(std::size_t{1} << 16, '\0');
    Check(lseek(from, 0, SEEK_SET) == 0, "Cannot read the temporary file");
    for (ssize_t count; (count = read(from, piece.data(), piece.size())) > 0;)
        Write(to, piece.substr(0, static_cast<std::size_t>(count)));
}

void Merge(const char* const* paths) {
    const std::string base = ReadFile(paths[0]), left = ReadFile(paths[1]), right = ReadFile(paths[2]);
    const std::string_view body = WithoutFileHeader(base);
    const Texts documents = Cut(body);
    Texts result = documents;
    for (const std::string* side : {&left, &right}) TakeChanges(documents, WithoutFileHeader(*side), result);
    char name[] = "/tmp/MERGEXXXXXX";
    const int temporary = mkstemp(name);
    Check(temporary >= 0, "Cannot make a temporary file");
    unlink(name);
    WriteDocuments(temporary, std::string_view(base).substr(0, base.size() - body.size()), result);
    const int destination = open(paths[3], O_WRONLY | O_CREAT | O_TRUNC | O_CLOEXEC, 0666);
    Check(destination >= 0, std::string("Cannot open ") + paths[3]);
    Copy(temporary, destination);
    Check(fsync(destination) == 0, "Cannot write");
}

} // namespace

int main(int count, char** words) {
    try {
        Check(count == 5, "usage: MergeFloor BASE LEFT RIGHT DESTINATION");
        Merge(words + 1);
    } catch (const std::exception& error) {
        std::cerr << error.what() << '\n';
        return 1;
    }
    return 0;
}
