#include "FuzzTarget.h"
#include "ReaderCheck.h"

std::string CheckInput(std::string_view input) {
    return ovrin_fuzz::CheckReader(ovrin_fuzz::FileOfInput(input));
}
