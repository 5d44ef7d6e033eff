#include "ReaderCheck.h"

#include "ErrorOf.h"
#include "TraitsCheck.h"
#include "TreeComparison.h"

#include "Reading/ObjectFile.h"
#include "Reading/ObjectFileReader.h"
#include "Repair/ObjectTraits.h"
#include "Writing/CheckTree.h"
#include "Writing/ObjectFileWriter.h"

#include <algorithm>
#include <sstream>

using namespace ovrin_yaml;
using failures::ErrorOf;

namespace ovrin_fuzz {

const char* const kFileHeader = "%YAML 1.1\n%TAG !o! tag:ovrin.dev,2011:\n";

namespace {

enum class Way { Library, Fast, Recognised };

struct ReadFile {
    ReadFile(std::string_view file, Way way) {
        ReaderOptions options;
        options.fast = way != Way::Library;
        options.recognise = way == Way::Recognised;
        options.inspect = InspectObject;
        // Copies without spare room: reading behind their end is seen.
        failure = ErrorOf([&] {
            if (options.recognise)
                ReadTwice(file, options);
            else
                ParseYAMLFile(std::string(file), objects, options);
        });
    }

    /// Reads the file in parts, and along itself, so that no object must be built.
    void ReadTwice(std::string_view text, const ReaderOptions& options) {
        ObjectFile file(objects, options), same(side, options);
        file.TakeCut(InParts(text));
        file.Cut(nullptr);
        same.Take(std::string(text));
        same.Cut(&file);
        for (ObjectFile* each : {&file, &same}) {
            const std::size_t count = each->MakePieces();
            for (std::size_t piece = 0; piece < count; ++piece) each->ReadPiece(piece);
            each->Finish();
        }
    }

    static CutText InParts(std::string_view text) {
        const PartSource source = [text](std::size_t offset, char* bytes, std::size_t size) {
            return text.substr(std::min(offset, text.size())).copy(bytes, size);
        };
        const TaskRunner run = [](std::size_t count, const std::function<void(std::size_t)>& task) {
            for (std::size_t i = 0; i < count; ++i) task(i);
        };
        return ReadInParts(source, text.size(), run, 16 + text.size() % 64).value();
    }

    std::string Written() const {
        std::ostringstream stream;
        const std::string writeFailure = ErrorOf([&] { Output(objects, stream); });
        return stream.str() + "\nfailure: " + writeFailure;
    }

    OvrinObjects objects, side;
    std::string failure;
};

} // namespace

std::string FileOfInput(std::string_view input) {
    if (input.starts_with('%')) return std::string(input);
    return std::string(kFileHeader) + "--- !o!4 &12\n" + std::string(input);
}

std::string CheckReader(std::string_view file) {
    const ReadFile plain(file, Way::Library);
    const std::string written = plain.Written();
    for (const Way way : {Way::Fast, Way::Recognised}) {
        const ReadFile fast(file, way);
        if (fast.failure != plain.failure)
            return "failures: '" + fast.failure + "' and '" + plain.failure + "'";
        // Ahead of what builds all objects.
        if (fast.Written() != written) return "written:\n" + fast.Written() + "and\n" + written;
        const YAMLMapping& root = fast.objects.GetMapping();
        std::string finding = FirstDifference(root, plain.objects.GetMapping());
        if (!finding.empty()) return "trees:" + finding;
        finding = CheckTree(root, TreeStage::Hashed) + CheckTraits(root);
        if (!finding.empty()) return finding;
    }
    return CheckTree(plain.objects.GetMapping(), TreeStage::Hashed) + CheckTraits(plain.objects.GetMapping());
}

} // namespace ovrin_fuzz
