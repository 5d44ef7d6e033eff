#include "Settle/ExternalTool.h"

#include "Destination.h"
#include "Fallback.h"
#include "FileUtils.h"
#include "Names/PrintableText.h"
#include "Systems/ChildProcess.h"
#include "Systems/ScratchFolder.h"
#include "Words/Failure.h"
#include "Words/WriteFailure.h"

#include <cerrno>
#include <system_error>
#include <unistd.h>

namespace ovrin {

namespace {

std::string Read(const std::string& file) {
    std::string bytes;
    if (ReadWholeFile(file, bytes) != ReadResult::Complete)
        throw Failure(Printable(file) + " can't be read: " + std::system_category().message(errno));
    return bytes;
}

void Write(const std::string& file, const std::string& bytes, Durability durability) {
    const Content content{bytes.size(), [&](OutputStream& stream) { stream << bytes; }, durability};
    if (const int error = Deliver(file, content))
        throw Failure(Printable(file) + " can't be written: " + WhyNotWritten(error));
}

/// The file, or one that stands for it where it is missing or empty: a scene without objects, with the header
/// of `other`.
std::string ObjectsOf(const std::string& file, const std::string& other, const ScratchFolder& scratch) {
    if (!IsMissing(file) && !IsFileEmpty(file)) return file;
    const std::string text = Read(other);
    const std::size_t begin = text.starts_with("--- ") ? 0 : text.find("\n--- ");
    std::string standIn = scratch.File("none");
    Write(standIn, begin == 0 ? "" : text.substr(0, begin == std::string::npos ? begin : begin + 1),
          Durability::Unsynced);
    return standIn;
}

void WantToolList() {
    const std::string file = GetSpecFilename(kDefaultSpecFile);
    if (!FileExists(file.c_str()))
        throw Failure(Printable(file) + ", which names the merge tools, is missing or can't be read: install "
                                        "the program whole, or write ~/.mergespecfile.txt, as "
                                        "mergespecfile(5) tells");
}

} // namespace

void MergeWithTool(const ToolFiles& files) {
    WantToolList();
    const ScratchFolder scratch;
    const std::string result = scratch.File("result");
    // A path that looks like an option is none to a program that gets it from here.
    const auto plain = [](const std::string& path) { return path.starts_with('-') ? "./" + path : path; };
    const CommandWords command = {GetDataFilesDir() + "OvrinMerge",
                                  "merge",
                                  "-p",
                                  "--force",
                                  plain(ObjectsOf(files.base, files.theirs, scratch)),
                                  plain(files.theirs),
                                  plain(files.ours),
                                  result,
                                  scratch.File("base"),
                                  scratch.File("ours")};
    const int status =
        WaitForProcess(StartProcess(command, {}, {STDIN_FILENO, STDOUT_FILENO, STDERR_FILENO}));
    // A tool that fails ends with status 0 too, and no result.
    if (status != 0 || IsMissing(result) || IsFileEmpty(result))
        throw Failure("The merge tool has left no result, and " + Printable(files.result) + " is as it was");
    Write(files.result, Read(result), Durability::Synced);
}

} // namespace ovrin
