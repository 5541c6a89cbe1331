#pragma once

#include <cstddef>
#include <string>
#include <string_view>

// Texts on a screen, whose width is the number of their characters in UTF-8.
namespace senseloom::tool {

size_t widthOf(std::string_view text);

// The text with a blank for each control character, so that it cannot do anything to a terminal.
std::string harmless(std::string_view text);

// The text itself, or if it is wider its beginning with an ellipsis behind it.
std::string shortenedTo(size_t width, const std::string& text);

// Does nothing to an empty text.
void removeLastCharacter(std::string& text);

// The text, filled with blanks behind it, or in front of it.
std::string paddedBehind(size_t width, const std::string& text);
std::string paddedInFront(size_t width, const std::string& text);

}  // namespace senseloom::tool
