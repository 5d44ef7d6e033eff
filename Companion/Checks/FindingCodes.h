#pragma once

#include <cstdint>
#include <span>
#include <string_view>

namespace ovrin {

/// What a check may find.
enum class Code : std::uint8_t {
    Unreadable,
    ConflictMarkers,
    OpenConflict,
    LfsPointer,
    Binary,
    Empty,
    NoScene,
    RepeatedId,
    RepeatedKey,
    DanglingReference,
    FatherLacksChild,
    FatherIsNoTransform,
    ChildOfAnother,
    RepeatedChild,
    ParentLoop,
    ComponentNotListed,
    OwnerIsNoGameObject,
    ComponentOfAnother,
    RepeatedComponent,
    MissingComponent,
    NotAsWritten,
};

enum class Severity : std::uint8_t { Error, Warning };

/// What people and scripts are told of a code.
struct CodeInfo {
    Code code;
    const char* name; ///< stable: scripts and baselines go by it
    Severity severity;
    const char* title;
    const char* explanation; ///< what it means, how it comes about, and the cure
};

/// All of them, in the order of Code.
std::span<const CodeInfo> CodeTable();

const CodeInfo& InfoOf(Code code);
/// The one of that name, or null.
const CodeInfo* FindCode(std::string_view name);

} // namespace ovrin
