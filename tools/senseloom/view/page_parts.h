#pragma once

#include <string_view>

// What is the same in every page. The build makes it of the files in view/page/.
namespace senseloom::tool::page {

extern const std::string_view kScript;
extern const std::string_view kStyle;
extern const std::string_view kBody;
// Their SHA-256, as hexadecimal digits.
extern const std::string_view kScriptHash;
extern const std::string_view kStyleHash;

}  // namespace senseloom::tool::page
