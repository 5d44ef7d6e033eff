#include "FuzzTarget.h"
#include "MergeCheck.h"

std::string CheckInput(std::string_view input) {
    return ovrin_fuzz::CheckMerge(ovrin_fuzz::TextsOfInput(input));
}

std::vector<std::string> FilesOfInput(std::string_view input) {
    const ovrin_fuzz::MergeTexts texts = ovrin_fuzz::TextsOfInput(input);
    return {texts.base, texts.left, texts.right};
}

std::string InputOfFiles(const std::vector<std::string>& files) {
    return ovrin_fuzz::InputOfTexts({files[0], files[1], files[2]});
}
