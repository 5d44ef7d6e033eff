#include "FuzzTarget.h"
#include "ReaderCheck.h"

std::string CheckInput(std::string_view input) {
    return ovrin_fuzz::CheckReader(ovrin_fuzz::FileOfInput(input));
}

std::vector<std::string> FilesOfInput(std::string_view input) {
    return {std::string(input)};
}

std::string InputOfFiles(const std::vector<std::string>& files) {
    return files[0];
}
