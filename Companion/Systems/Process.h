#pragma once

#include <string>
#include <string_view>
#include <utility>
#include <vector>

namespace ovrin {

/// A program and its arguments, which pass no shell.
using CommandWords = std::vector<std::string>;

/// What a program is started with.
struct ProcessSetting {
    std::string folder = {}; ///< to run in; empty for the present one
    std::string input = {};  ///< its standard input
    std::vector<std::pair<std::string, std::string>> environment = {}; ///< added to the one of this process
    bool showErrors = false; ///< its standard error is that of this process, not kept
};

/// How a program ended and what it said.
struct ProcessResult {
    int status; ///< its exit status; 128 and the signal's number for one that a signal ended
    std::string output;
    std::string errors;

    bool Succeeded() const { return status == 0; }
};

/// Runs a program, found on the path, to its end. It may end without reading its input, which a process
/// survives that called OutliveFailedWrites. Throws Failure if it can't be started.
ProcessResult RunProcess(const CommandWords& command, const ProcessSetting& setting = {});

/// The same for a program that must succeed: its output. Throws Failure with what it said on standard error.
std::string OutputOf(const CommandWords& command, const ProcessSetting& setting = {});

/// The same for a program that is asked for one value: what it says without the end of its last line. Empty
/// where it ends with status 1, by which git and Mercurial say that there is none.
std::string AnswerOf(const CommandWords& command, const ProcessSetting& setting = {});

/// A text without the end of its last line.
std::string WithoutLineEnd(std::string text);

/// The texts that a program lists with a zero byte behind each, as they do with names of any bytes.
std::vector<std::string> ZeroEndedTexts(std::string_view listed);

/// Where the program of that name stands on the path, as execution would find it; empty if it doesn't.
std::string FindProgram(const std::string& name);

} // namespace ovrin
