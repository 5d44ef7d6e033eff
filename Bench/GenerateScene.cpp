#include "SceneGenerator.h"

#include <cmath>
#include <fstream>
#include <iostream>
#include <map>
#include <stdexcept>
#include <string>
#include <vector>

using ovrin_bench::SceneCounts;
using ovrin_bench::SceneOptions;

namespace {

const char* const kUsage =
    "usage: GenerateScene [options] DIRECTORY\n"
    "Writes base.ovrin, left.ovrin and right.ovrin, and resolve.txt for the mode conflicts.\n"
    "  --size BYTES       size of a file, e.g. 500K, 50M (default 1M)\n"
    "  --objects N        number of objects instead of a size\n"
    "  --seed N           the same seed gives the same files (default 1)\n"
    "  --edited SHARE     share of the objects that each side edits, 0 to 1 (default 0.01)\n"
    "  --conflicts N      true conflicts among the edits of the mode random (default 0)\n"
    "  --mode MODE        random (default): both sides edit, add, remove and move objects\n"
    "                     disjoint: both sides edit the same objects, in different fields\n"
    "                     bigbase-list N keyed|equal: one list of N elements\n"
    "                     conflicts N: N objects that both sides changed, and decisions for them\n"
    "                     remove, add: the right side without half of the objects, or with twice as many\n";

struct Arguments {
    SceneOptions options;
    std::string directory;
};

class ArgumentReader {
public:
    ArgumentReader(int count, char** words) : m_Words(words + 1, words + count) {}

    Arguments Read() {
        while (m_At < m_Words.size()) ReadOne(Next());
        if (m_Result.directory.empty()) throw std::runtime_error("No directory given");
        SceneOptions& options = m_Result.options;
        bool endsByCount = options.mode == SceneOptions::Mode::Conflicts;
        if (!options.size && !options.objects && !endsByCount) options.size = 1 << 20;
        return m_Result;
    }

private:
    const std::string& Next() {
        if (m_At == m_Words.size()) throw std::runtime_error("Missing value behind " + m_Words.back());
        return m_Words[m_At++];
    }

    /// A number of bytes or things, with K, M or G behind it for powers of 1024.
    std::uint64_t NextNumber() {
        const std::string& text = Next();
        std::size_t end = 0;
        std::uint64_t number = std::stoull(text, &end);
        if (end == text.size()) return number;
        std::size_t power = std::string("KMG").find(text[end]);
        if (power == std::string::npos || end + 1 != text.size())
            throw std::runtime_error("Bad number " + text);
        return number << (10 * (power + 1));
    }

    void ReadOne(const std::string& word) {
        SceneOptions& options = m_Result.options;
        if (word == "--size")
            options.size = NextNumber();
        else if (word == "--objects")
            options.objects = NextNumber();
        else if (word == "--seed")
            options.seed = NextNumber();
        else if (word == "--edited")
            options.edited = static_cast<std::uint64_t>(std::llround(std::stod(Next()) * 1e6));
        else if (word == "--conflicts")
            options.conflicts = NextNumber();
        else if (word == "--mode")
            ReadMode(Next());
        else if (word.starts_with("-") || !m_Result.directory.empty())
            throw std::runtime_error("Unknown argument " + word);
        else
            m_Result.directory = word;
    }

    void ReadMode(const std::string& name) {
        using Mode = SceneOptions::Mode;
        static const std::map<std::string, Mode> modes = {
            {"random", Mode::Random},       {"disjoint", Mode::Disjoint}, {"bigbase-list", Mode::BigList},
            {"conflicts", Mode::Conflicts}, {"remove", Mode::Remove},     {"add", Mode::Add}};
        auto mode = modes.find(name);
        if (mode == modes.end()) throw std::runtime_error("Unknown mode " + name);
        m_Result.options.mode = mode->second;
        if (mode->second == Mode::Conflicts) m_Result.options.conflicts = NextNumber();
        if (mode->second != Mode::BigList) return;
        m_Result.options.listLength = NextNumber();
        const std::string& kind = Next();
        if (kind != "keyed" && kind != "equal") throw std::runtime_error("Unknown kind of list " + kind);
        m_Result.options.keyedList = kind == "keyed";
    }

    std::vector<std::string> m_Words;
    std::size_t m_At = 0;
    Arguments m_Result;
};

std::ofstream OpenForWriting(const std::string& path) {
    std::ofstream file(path, std::ios::binary);
    if (!file) throw std::runtime_error("Cannot write " + path);
    return file;
}

void Close(std::ofstream& file) {
    file.close();
    if (!file) throw std::runtime_error("Writing failed");
}

SceneCounts WriteFiles(const Arguments& arguments) {
    std::ofstream base = OpenForWriting(arguments.directory + "/base.ovrin");
    std::ofstream left = OpenForWriting(arguments.directory + "/left.ovrin");
    std::ofstream right = OpenForWriting(arguments.directory + "/right.ovrin");
    std::ofstream resolve;
    bool hasDecisions = arguments.options.mode == SceneOptions::Mode::Conflicts;
    if (hasDecisions) resolve = OpenForWriting(arguments.directory + "/resolve.txt");
    SceneCounts counts =
        GenerateScene(arguments.options, {base, left, right, hasDecisions ? &resolve : nullptr});
    Close(base);
    Close(left);
    Close(right);
    if (hasDecisions) Close(resolve);
    return counts;
}

void Print(const char* name, const std::uint64_t (&bySide)[2]) {
    std::cout << ", " << name << ' ' << bySide[0] << '/' << bySide[1];
}

} // namespace

int main(int count, char** words) {
    try {
        SceneCounts counts = WriteFiles(ArgumentReader(count, words).Read());
        std::cout << counts.objects << " objects, " << counts.bytes << " bytes";
        Print("changed", counts.changed);
        Print("added", counts.added);
        Print("removed", counts.removed);
        std::cout << ", conflicts " << counts.conflicts << '\n';
        return 0;
    } catch (const std::exception& error) {
        std::cerr << error.what() << '\n' << kUsage;
        return 1;
    }
}
