#include "Reading/ObjectFileReader.h"

#include "Reading/ObjectFile.h"

namespace ovrin_yaml {

namespace {

void CutAndRead(ObjectFile& file) {
    file.Cut(nullptr);
    const std::size_t count = file.MakePieces();
    for (std::size_t piece = 0; piece < count; ++piece) file.ReadPiece(piece);
    file.Finish();
}

} // namespace

void ParseYAMLString(std::string text, OvrinObjects& objects, ReaderOptions options) {
    ObjectFile file(objects, options);
    file.TakeText(std::move(text));
    CutAndRead(file);
}

void ParseYAMLFile(std::string bytes, OvrinObjects& objects, ReaderOptions options) {
    ObjectFile file(objects, options);
    file.Take(std::move(bytes));
    CutAndRead(file);
}

} // namespace ovrin_yaml
