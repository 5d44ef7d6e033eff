#pragma once

#include "Values/TaskRunner.h"
#include "Values/YAMLMapping.h"

namespace ovrin_yaml {

// The transitions of a state machine may be stored as a mapping with repeated keys, which can't be diffed:
//
//     AnimatorStateMachine:                      AnimatorStateMachine:
//       m_StateMachineTransitions:                 m_StateMachineTransitions:
//         first: {fileID: 1}           <-->        - first: {fileID: 1}
//         first: {fileID: 2}                       - first: {fileID: 2}
//
// For diff and merge they are a list of mappings with one key, whether or not a key repeats. The flow style
// goes along. No other field and no other class is touched. Where there is a `run`, it looks for such
// objects.

/// Turns the mappings of a file that was read into lists, and builds the hashes of these objects anew, from
/// here on over the data of the object's header as well.
/// Throws YAMLError "Expected key to point to yaml mapping: " and the key for transitions that are no
/// mapping, and the duplicate-keys text where an object or a state machine repeats a key.
void PreProcess(YAMLMapping& root, const TaskRunner& run = {});

/// Turns the lists of a merged file back into mappings. As in reading, an equal repetition of a key is
/// dropped up to the first unequal one. Throws YAMLError "Expected key to point to yaml sequence: " or
/// "Expected size of one for key: " and the key.
void RestoreRepeatedKeys(YAMLMapping& root, const TaskRunner& run = {});

} // namespace ovrin_yaml
