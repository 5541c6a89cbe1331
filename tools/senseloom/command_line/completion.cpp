#include "command_line/completion.h"

#include <algorithm>
#include <optional>
#include <string_view>
#include <utility>
#include <vector>

#include "command_line/option_value.h"
#include "kinds/option_data.h"

namespace senseloom::tool {
namespace {

struct Candidate {
  std::string word;
  std::string means;
};

// What can stand at a place: words, and what the shell itself knows.
struct Candidates {
  const char* others = "nothing";
  std::vector<Candidate> words = {};
};

// What stands for a file, a folder or a program in help.
const char* othersOf(const std::string& value) {
  constexpr std::pair<std::string_view, const char*> kOthers[] = {
      {"FILE", "files"}, {"PICTURE", "files"}, {"TRACE", "files"}, {"FOLDER", "folders"}, {"PROGRAM", "programs"}};
  for (const auto& [name, others] : kOthers) {
    if (value.find(name) != std::string::npos) return others;
  }
  return "nothing";
}

Candidates valuesOf(const CLI::Option& option) {
  const std::string value = valueName(option);
  Candidates candidates{.others = othersOf(value)};
  for (const std::string& name : valueNames(option)) candidates.words.push_back({name, ""});
  if (value.find("SENSOR") != std::string::npos) {
    for (const OptionDescription* kind : optionDescriptions()) candidates.words.push_back({kind->sensor, kind->title});
  }
  return candidates;
}

// Where the last word stands, as far as the words before it tell.
class Place {
 public:
  explicit Place(const CLI::App& app) : command(&app) {}

  void pass(const std::string& word) {
    if (std::exchange(option, nullptr) != nullptr) return;
    if (word == "--") {
      areOptionsOver = true;
    } else if (!areOptionsOver && word.size() > 1 && word.front() == '-') {
      const CLI::Option* given = word.find('=') == std::string::npos ? command->get_option_no_throw(word) : nullptr;
      if (given != nullptr && given->get_items_expected_max() != 0) option = given;
    } else if (const CLI::App* below = commandNamed(word)) {
      command = below;
    } else {
      ++arguments;
    }
  }

  Candidates candidates(const std::string& word) const {
    if (option != nullptr) return valuesOf(*option);
    if (!areOptionsOver && !word.empty() && word.front() == '-') return options();
    Candidates found;
    const auto positionals = command->get_options([](const CLI::Option* one) { return one->get_positional(); });
    if (!positionals.empty()) {
      const size_t last = positionals.size() - 1;
      const bool isProgram = areOptionsOver && valueName(*positionals[last]) == "PROGRAM";
      found = valuesOf(*positionals[isProgram ? last : std::min(arguments, last)]);
    }
    for (const CLI::App* below : command->get_subcommands({})) {
      found.words.push_back({below->get_name(), below->get_description()});
    }
    return found;
  }

 private:
  const CLI::App* commandNamed(const std::string& name) const {
    const auto all = command->get_subcommands({});
    const auto found = std::find_if(all.begin(), all.end(), [&](auto* below) { return below->get_name() == name; });
    return found == all.end() ? nullptr : *found;
  }

  Candidates options() const {
    Candidates found;
    for (const CLI::Option* one : command->get_options()) {
      for (const std::string& name : one->get_lnames()) found.words.push_back({"--" + name, one->get_description()});
    }
    return found;
  }

  const CLI::App* command;
  const CLI::Option* option = nullptr;  // whose value comes next
  size_t arguments = 0;                 // so far that are neither a command, nor an option or its value
  bool areOptionsOver = false;
};

}  // namespace

void printCompletion(std::FILE* out, const CLI::App& app, std::span<const std::string> words) {
  Place place(app);
  for (size_t i = 0; i + 1 < words.size(); ++i) place.pass(words[i]);
  const std::string word = words.empty() ? "" : words.back();
  const Candidates candidates = place.candidates(word);
  std::fprintf(out, "%s\n", candidates.others);
  for (const Candidate& candidate : candidates.words) {
    if (candidate.word.rfind(word, 0) == 0) {
      std::fprintf(out, "%s\t%s\n", candidate.word.c_str(), candidate.means.c_str());
    }
  }
}

}  // namespace senseloom::tool
