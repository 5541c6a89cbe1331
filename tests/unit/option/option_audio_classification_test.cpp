#include "option/option_audio_classification.h"

#include <gtest/gtest.h>

#include <vector>

#include "option_test_support.h"

namespace senseloom {
namespace {

using AudioClassificationOption = OptionTest;

TEST_F(AudioClassificationOption, RendersTheIntervalWithIdZero) {
  auto option = parsed<OptionAudioClassification>(R"({"interval":-1})");
  EXPECT_EQ(entriesOf(listOf(option)), (std::vector<Property>{{0, 4, -1}}));
}

TEST_F(AudioClassificationOption, LastOneMergedDecides) {
  auto option = parsed<OptionAudioClassification>(R"({"interval":7})");
  option.merge(parsed<OptionAudioClassification>(R"({"interval":7})"));
  option.merge(parsed<OptionAudioClassification>(R"({"interval":9000})"));
  option.merge(parsed<OptionAudioClassification>(R"({"interval":30})"));
  EXPECT_EQ(option.interval(), 30);
}

TEST_F(AudioClassificationOption, LogsATextThatIsNoJsonButNotANullOne) {
  OptionAudioClassification option;
  EXPECT_EQ(option.parse(nullptr), -1);
  EXPECT_TRUE(fake::platform().takeLog().empty());
  EXPECT_EQ(option.parse("interval 5"), -1);
  EXPECT_EQ(fake::platform().takeLog(),
            std::vector{errorLine("audio : invalid opton string interval 5, all set as default")});
}

}  // namespace
}  // namespace senseloom
