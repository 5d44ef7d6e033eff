// Settles a generated scene (base.ovrin, left.ovrin, right.ovrin in a folder) as a person does it, in a
// repository of its own: opens it, looks at a screenful, takes sides one by one and all at once, and goes
// back. Prints the times, and by how much the memory of the process grew.

#include "FileUtils.h"
#include "Settle/SettleDesk.h"
#include "Systems/Process.h"
#include "Systems/ScratchFolder.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <stdexcept>
#include <string>
#include <vector>

using namespace ovrin;

namespace {

constexpr std::size_t kScreenful = 50, kSteps = 30;

std::string RunGit(CommandWords command, const std::string& input = "") {
    command.insert(command.begin(), "git");
    const ProcessResult result = RunProcess(command, {.input = input});
    if (!result.Succeeded()) throw std::runtime_error(result.errors);
    return result.output.substr(0, result.output.find('\n'));
}

/// Makes the present folder a repository in the midst of a merge of the three files.
void BeginMerge(const std::string& folder) {
    RunGit({"init", "-q"});
    std::string stages;
    const char* const files[] = {"base.ovrin", "right.ovrin", "left.ovrin"};
    for (int i = 0; i < 3; ++i)
        stages += "100644 " + RunGit({"hash-object", "-w", folder + files[i]}) + ' ' + std::to_string(i + 1) +
                  "\tscene.ovrin\n";
    RunGit({"update-index", "--index-info"}, stages);
    std::filesystem::copy_file(folder + "right.ovrin", "scene.ovrin");
}

/// Of this process, without what it shares with files.
double MemoryInMegabytes() {
    std::ifstream status("/proc/self/status");
    for (std::string word; status >> word;)
        if (double kilobytes = 0; word == "RssAnon:" && status >> kilobytes) return kilobytes / 1024;
    return 0;
}

/// Does something `count` times, and prints a line about it.
template <class Step> void Time(const char* name, std::size_t count, const Step& step) {
    const double before = MemoryInMegabytes();
    std::vector<double> milliseconds;
    for (std::size_t i = 0; i < count; ++i) {
        const auto start = std::chrono::steady_clock::now();
        step(i);
        milliseconds.push_back(
            std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count());
    }
    std::ranges::sort(milliseconds);
    std::printf("%-28s median %8.2f ms, slowest %8.2f ms, %7.2f MB more each\n", name,
                milliseconds[count / 2], milliseconds.back(),
                (MemoryInMegabytes() - before) / static_cast<double>(count));
}

void Settle() {
    Remarks remarks;
    std::unique_ptr<SettleScenes> scenes;
    std::unique_ptr<SettleDesk> desk;
    Time("open", 1, [&](std::size_t) {
        scenes = std::make_unique<SettleScenes>(remarks);
        scenes->Open(remarks);
        desk = std::make_unique<SettleDesk>(*scenes);
    });
    const std::size_t count = desk->Items().size();
    std::printf("%zu conflicts, %zu open\n", count, desk->CountOpen());
    if (!count) return;
    const auto at = [&](std::size_t i) { return i * desk->Items().size() / kSteps; };
    Time("describe a screenful", 10, [&](std::size_t page) {
        for (std::size_t i = 0; i < kScreenful; ++i)
            desk->Describe(desk->Items()[(page * count / 10 + i) % count]);
    });
    const auto take = [&](std::size_t i) { desk->Take(at(i), i % 2 ? Side::Ours : Side::Theirs); };
    Time("take", kSteps, take);
    Time("undo", kSteps, [&](std::size_t) { desk->Undo(); });
    Time("take all", 1, [&](std::size_t) { desk->TakeAll(Side::Ours); });
    Time("take, all being settled", kSteps, take);
    Time("undo, all being settled", kSteps, [&](std::size_t) { desk->Undo(); });
    Time("undo all", 1, [&](std::size_t) { desk->Undo(); });
    Time("redo all", 1, [&](std::size_t) { desk->Redo(); });
    std::printf("%zu open, %zu problems, %.0f MB\n", desk->CountOpen(), desk->Problems().size(),
                MemoryInMegabytes());
}

} // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fputs("usage: SettleBench FOLDER\n", stderr);
        return 1;
    }
    try {
        ovrin_yaml::initialize();
        const std::string folder = std::filesystem::absolute(argv[1]).string() + "/";
        const ScratchFolder scratch;
        std::filesystem::current_path(scratch.NewFolder("repository"));
        BeginMerge(folder);
        Settle();
    } catch (const std::exception& error) {
        std::fprintf(stderr, "%s\n", error.what());
        return 1;
    }
    return 0;
}
