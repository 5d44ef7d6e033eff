#pragma once

#include <string>

struct MergeConfig;

/// The smart merge of three object files: writes the result to `outputPath` and the conflict report where
/// `config` wants it, and two premerged files if conflicts are pending and both premerge paths are known.
///
/// Returns 0 without pending conflicts, 2 with them (their values go by `config.resolve`), 3 if the repair of
/// the object graph found broken component dependencies besides; 1, after a message, if the resolve file
/// can't be opened, or what somebody relies on can't be written: the result, the report where it shares
/// standard output with the result, the premerged files where a tool is to work on them. All other failures
/// are thrown: YAMLError and the standard family.
int HandleMergeCommand(const MergeConfig& config, const std::string& outputPath);
