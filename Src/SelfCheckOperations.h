#pragma once

class TestResults;

namespace self_check {

/// The part of the self check about single operations.
void TestOperations(TestResults& results);

} // namespace self_check
