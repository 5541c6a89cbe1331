#pragma once

#include <CLI/CLI.hpp>
#include <cstdio>
#include <span>
#include <string>

namespace senseloom::tool {

// What a shell asks the tool with, in front of the words of a command line.
inline constexpr char kComplete[] = "--complete";

// Prints what the last word of a command line can be completed to, for a shell. The words are those behind the name of
// the tool. The first line is what else can stand there: "files", "folders", "programs" or "nothing". Each further line
// is a word, a tab and what it means.
void printCompletion(std::FILE* out, const CLI::App& app, std::span<const std::string> words);

}  // namespace senseloom::tool
