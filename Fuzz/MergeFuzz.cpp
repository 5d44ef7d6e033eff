#include "FuzzTarget.h"
#include "MergeCheck.h"

std::string CheckInput(std::string_view input) {
    return ovrin_fuzz::CheckMerge(ovrin_fuzz::TextsOfInput(input));
}
