#include "Document/ObjectFileReader.h"

namespace ovrin_yaml {

namespace {

bool CutAndRead(ObjectFile& file) {
    file.Cut(nullptr);
    for (std::size_t piece = 0; piece < file.PieceCount(); ++piece) file.ReadPiece(piece);
    return file.Finish();
}

} // namespace

bool ParseYAMLString(std::string text, OvrinObjects& objects, ReaderOptions options) {
    ObjectFile file(objects, options);
    file.TakeText(std::move(text));
    return CutAndRead(file);
}

bool ParseYAMLFile(std::string bytes, OvrinObjects& objects, ReaderOptions options) {
    ObjectFile file(objects, options);
    file.Take(std::move(bytes));
    return CutAndRead(file);
}

} // namespace ovrin_yaml
