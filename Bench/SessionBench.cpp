// Merges the three files of a generated scene (base.ovrin, left.ovrin, right.ovrin in a folder) again and
// again, as an interactive program does: each time one more conflict is decided. Prints the times.

#include "InputFiles.h"

#include "Session/MergeSession.h"

#include <algorithm>
#include <chrono>
#include <cstdio>
#include <string>
#include <sys/resource.h>

using namespace ovrin_yaml;

namespace {

void MergeAgain(MergeSession& session, const std::vector<RecordResolve>& decisions) {
    session.Decide(decisions);
    session.Merge();
    session.Apply();
    session.Repair();
}

std::vector<RecordResolve> DecisionsForAll(const MergeSession& session) {
    std::vector<RecordResolve> decisions;
    for (const auto* conflict : session.PendingConflicts()) {
        const Path path = conflict->path.Elements();
        decisions.push_back({path, decisions.size() % 2 ? ResolveLeft : ResolveRight});
    }
    return decisions;
}

long MemoryInKilobytes() {
    rusage usage{};
    getrusage(RUSAGE_SELF, &usage);
    return usage.ru_maxrss;
}

} // namespace

int main(int argc, char** argv) {
    if (argc != 2) {
        std::fputs("usage: SessionBench FOLDER\n", stderr);
        return 1;
    }
    initialize();
    const std::string folder = std::string(argv[1]) + "/";
    MergeSession session;
    session.Read({FileInput(folder + "base.ovrin"), FileInput(folder + "left.ovrin"),
                  FileInput(folder + "right.ovrin")});
    session.Prepare();
    session.Diff();
    MergeAgain(session, {});
    const std::vector<RecordResolve> all = DecisionsForAll(session);
    const long before = MemoryInKilobytes();
    std::vector<double> milliseconds;
    std::vector<RecordResolve> decisions;
    for (const RecordResolve& next : all) {
        decisions.push_back(next);
        const auto start = std::chrono::steady_clock::now();
        MergeAgain(session, decisions);
        milliseconds.push_back(
            std::chrono::duration<double, std::milli>(std::chrono::steady_clock::now() - start).count());
    }
    if (milliseconds.empty()) return 0;
    std::sort(milliseconds.begin(), milliseconds.end());
    std::printf("%zu merges: median %.2f ms, slowest %.2f ms, %.0f KB each; %zu conflicts left\n",
                milliseconds.size(), milliseconds[milliseconds.size() / 2], milliseconds.back(),
                static_cast<double>(MemoryInKilobytes() - before) / static_cast<double>(milliseconds.size()),
                session.PendingConflicts().size());
    return 0;
}
