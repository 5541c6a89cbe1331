#include "terminal/text_table.h"

#include <gtest/gtest.h>

#include "printed.h"

namespace senseloom::tool {
namespace {

TEST(TextTable, AlignsColumnsAndEndsLinesWithoutBlanks) {
  EXPECT_EQ(printed([](std::FILE* out) {
              printTable(out, {{"key", "range", "note"}, {"classMask", "1..3", ""}, {"a", "", "b"}});
            }),
            "  key        range  note\n"
            "  classMask  1..3\n"
            "  a                 b\n");
}

TEST(TextTable, AlignsNumbersToTheRight) {
  EXPECT_EQ(printed([](std::FILE* out) {
              printTable(out, {{"who", "n"}, {"a", "100"}, {"bb", "7"}}, 1);
            }),
            "  who    n\n"
            "  a    100\n"
            "  bb     7\n");
}

TEST(TextTable, OfNoRowsIsEmpty) {
  EXPECT_EQ(printed([](std::FILE* out) { printTable(out, {}); }), "");
}

}  // namespace
}  // namespace senseloom::tool
