#pragma once

#include <string>

namespace senseloom::tool {

// Throws std::runtime_error if the file cannot be written. What it holds stays in it.
void requireWritable(const std::string& file);
// Replaces what the file holds. Throws std::runtime_error if it cannot be written.
void writePicture(const std::string& file, const std::string& picture);

}  // namespace senseloom::tool
