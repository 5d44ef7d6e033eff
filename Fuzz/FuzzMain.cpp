#include "FuzzTarget.h"

#include "Values/YAMLScalar.h"

#include <cstddef>
#include <cstdint>
#include <cstdio>
#include <cstdlib>

extern "C" int LLVMFuzzerInitialize(int*, char***) {
    ovrin_yaml::initialize();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    const std::string finding = CheckInput({reinterpret_cast<const char*>(data), size});
    if (finding.empty()) return 0;
    std::fprintf(stderr, "finding: %s\n", finding.c_str());
    std::abort();
}
