#include "view/page.h"

#include <string_view>
#include <utility>

#include "plot/palette.h"
#include "plot/svg_text.h"
#include "trace/hex.h"
#include "trace/time_unit.h"
#include "view/packed_numbers.h"
#include "view/page_parts.h"

namespace senseloom::tool {
namespace {

// A browser runs and applies only what has this hash, so not even markup that came into the page would do anything.
std::string policyOf(std::string_view digits) {
  return "'sha256-" + base64(*fromHex(digits)) + '\'';
}

std::string headText(const std::string& title) {
  return "<!doctype html>\n<html lang=\"en\">\n<head>\n<meta charset=\"utf-8\">\n"
         "<meta http-equiv=\"Content-Security-Policy\" content=\"default-src 'none'; script-src " +
         policyOf(page::kScriptHash) + "; style-src " + policyOf(page::kStyleHash) +
         "\">\n<meta name=\"viewport\" content=\"width=device-width\">\n<title>" + xmlText(title) + "</title>\n<style>";
}

// JSON as it may stand in an element of the page: nothing in it is taken for markup.
std::string markupFree(std::string json) {
  for (size_t at = json.find('<'); at != std::string::npos; at = json.find('<', at)) json.replace(at, 1, "\\u003c");
  return json;
}

Json paletteOf(const char* HueColour::*ground) {
  Json colours(json_array());
  for (const HueColour& colour : kHueColours) json_array_append_new(colours.get(), json_string(colour.*ground));
  return colours;
}

void writeLines(OutputSink& sink, const char* id, const std::vector<std::string>& lines) {
  sink.write(std::string("<script type=\"text/plain\" id=\"") + id + "\">");
  for (size_t i = 0; i < lines.size(); ++i) {
    if (i > 0) sink.write("\n");
    sink.write(lines[i]);
  }
  sink.write("</script>\n");
}

}  // namespace

void writePage(OutputSink& sink, const PageData& data, const PageHead& head) {
  const Json summary = data.summary(head.classNames);
  addMember(summary, "title", textJson(head.title));
  addMember(summary, "timeUnit", Json(json_integer(head.timeUnit.value_or(kMillisecond))));
  addMember(summary, "lightHues", paletteOf(&HueColour::light));
  addMember(summary, "darkHues", paletteOf(&HueColour::dark));

  sink.write(headText(head.title));
  sink.write(page::kStyle);
  sink.write("</style>\n</head>\n<body>\n");
  sink.write(page::kBody);
  sink.write("<script type=\"application/json\" id=\"summary\">" + markupFree(compactText(summary.get())) +
             "</script>\n");
  writeLines(sink, "levels", data.pageRecords().levelTexts());
  writeLines(sink, "records", data.pageRecords().blocks());
  sink.write("<script>");
  sink.write(page::kScript);
  sink.write("</script>\n</body>\n</html>\n");
}

}  // namespace senseloom::tool
