#pragma once

#include "ExitStatus.h"

#include <string>

class DestinationDraft;
struct MergeConfig;

/// The smart merge of three object files: writes the result to `outputPath` and the conflict report where
/// `config` wants it, and two premerged files if conflicts are pending and both premerge paths are known.
/// A result that is to be delivered has `draft` follow it, where there is one.
///
/// Returns Done without pending conflicts, Conflicts with them (their values go by `config.resolve`),
/// BrokenDependencies if the repair of the object graph found broken component dependencies besides; Failed,
/// after a message, if the resolve file can't be opened, or what somebody relies on can't be written: the
/// result, the report where it shares standard output with the result, the premerged files where a tool is to
/// work on them. All other failures are thrown: YAMLError and the standard family.
ExitStatus HandleMergeCommand(const MergeConfig& config, const std::string& outputPath,
                              DestinationDraft* draft = nullptr);
