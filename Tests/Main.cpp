#include "Descriptor.h"

#include <gtest/gtest.h>

/// As in the programs, a write to a program that ended is an error and no end.
int main(int count, char** words) {
    OutliveFailedWrites();
    testing::InitGoogleTest(&count, words);
    return RUN_ALL_TESTS();
}
