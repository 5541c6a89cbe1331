#pragma once

#include <span>
#include <string>
#include <string_view>

namespace senseloom::tool {

// One colour of a picture, as it is on a light page and on a dark one.
struct SvgColour {
  const char* selector;
  const char* property;
  const char* light;
  const char* dark;
};

// Puts the parts of a picture together.
class SvgCanvas {
 public:
  void add(const std::string& element) { body += element; }
  void addText(double x, double baseline, const char* classes, std::string_view text, const char* anchor = "start");
  // Nothing if the path is empty.
  void addPath(const char* classes, const std::string& path);

  // The whole picture. `rules` are those of its style beside the colours and the fonts.
  std::string document(const std::string& title, double width, double height, const char* rules,
                       std::span<const SvgColour> colours) const;

 private:
  std::string body;
};

}  // namespace senseloom::tool
