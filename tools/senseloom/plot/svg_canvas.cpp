#include "plot/svg_canvas.h"

#include "plot/svg_text.h"

namespace senseloom::tool {
namespace {

std::string style(const char* rules, std::span<const SvgColour> colours) {
  std::string light;
  std::string dark;
  for (const SvgColour& row : colours) {
    const std::string begin = std::string(row.selector) + '{' + row.property + ':';
    light += begin + row.light + '}';
    dark += begin + row.dark + '}';
  }
  return "<style>text{font:12px system-ui,-apple-system,\"Segoe UI\",Roboto,\"DejaVu Sans\",sans-serif}"
         ".head{font-size:15px;font-weight:600}.name{font-weight:600}.small{font-size:11px}" +
         std::string(rules) + '\n' + light + "\n@media (prefers-color-scheme:dark){" + dark + "}</style>\n";
}

}  // namespace

void SvgCanvas::addText(double x, double baseline, const char* classes, std::string_view text, const char* anchor) {
  body += "<text x=\"" + coordinate(x) + "\" y=\"" + coordinate(baseline) + "\" class=\"" + classes + '"';
  if (std::string_view(anchor) != "start") body += std::string(" text-anchor=\"") + anchor + '"';
  body += '>' + xmlText(text) + "</text>\n";
}

void SvgCanvas::addPath(const char* classes, const std::string& path) {
  if (!path.empty()) body += std::string("<path class=\"") + classes + "\" d=\"" + path + "\"/>\n";
}

std::string SvgCanvas::document(const std::string& title, double width, double height, const char* rules,
                                std::span<const SvgColour> colours) const {
  const std::string size = coordinate(width) + ' ' + coordinate(height);
  return "<svg xmlns=\"http://www.w3.org/2000/svg\" viewBox=\"0 0 " + size + "\" width=\"" + coordinate(width) +
         "\" height=\"" + coordinate(height) + "\" role=\"img\">\n<title>" + xmlText(title) + "</title>\n" +
         style(rules, colours) + "<rect class=\"back\" width=\"100%\" height=\"100%\"/>\n" + body + "</svg>\n";
}

}  // namespace senseloom::tool
