// Half of the new inputs are made by edits of files, the others by libFuzzer's changes of bytes.
#include "FileEdits.h"
#include "FuzzTarget.h"

#include <algorithm>
#include <cstddef>
#include <cstdint>
#include <cstring>

extern "C" std::size_t LLVMFuzzerMutate(std::uint8_t* data, std::size_t size, std::size_t maxSize);

extern "C" std::size_t LLVMFuzzerCustomMutator(std::uint8_t* data, std::size_t size, std::size_t maxSize,
                                               unsigned seed) {
    if (seed % 2) return LLVMFuzzerMutate(data, size, maxSize);
    std::vector<std::string> files = FilesOfInput({reinterpret_cast<const char*>(data), size});
    ovrin_fuzz::FileEdits edits(seed);
    for (unsigned count = 1 + seed / 2 % 4; count > 0; --count) edits.Edit(files);
    const std::string input = InputOfFiles(files);
    if (input.size() > maxSize) return LLVMFuzzerMutate(data, size, maxSize);
    std::memcpy(data, input.data(), input.size());
    return input.size();
}
