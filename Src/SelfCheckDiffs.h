#pragma once

class TestResults;

namespace self_check {

/// The part of the self check about diffs of mappings and sequences, and their merge.
void TestDiffs(TestResults& results);

} // namespace self_check
