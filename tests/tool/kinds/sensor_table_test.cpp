#include "kinds/sensor_table.h"

#include <gtest/gtest.h>

#include "input_error.h"
#include "kinds/option_data.h"

namespace senseloom::tool {
namespace {

TEST(SensorTable, HasARowForEachSensorThatHasOptions) {
  for (const OptionDescription* kind : optionDescriptions()) {
    ASSERT_NE(findSensor(kind->sensor), nullptr) << kind->sensor;
    EXPECT_STREQ(sensorNamed(kind->sensor).name, kind->sensor);
  }
}

TEST(SensorTable, KnowsNamesToTheLetter) {
  EXPECT_EQ(findSensor("phyac"), nullptr);
  EXPECT_EQ(findSensor("PHYA"), nullptr);
  EXPECT_EQ(findSensor(""), nullptr);
  EXPECT_THROW(sensorNamed("phyac"), InputError);
}

TEST(SensorTable, NamesThePropertyOfBytesAsTheLibraryDoes) {
  EXPECT_STREQ(propertyName("DTWGS", sensorNamed("DTWGS").bytesProperty), "templateData");
}

}  // namespace
}  // namespace senseloom::tool
