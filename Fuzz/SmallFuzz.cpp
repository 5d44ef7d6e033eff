#include "FuzzTarget.h"
#include "SmallChecks.h"

std::string CheckInput(std::string_view input) {
    return ovrin_fuzz::OVRIN_FUZZ_CHECK(input);
}
