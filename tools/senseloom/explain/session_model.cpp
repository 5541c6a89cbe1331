#include "explain/session_model.h"

#include <string_view>

#include "explain/activity_model.h"
#include "explain/filter_models.h"
#include "explain/gathering_model.h"
#include "explain/gesture_model.h"

namespace senseloom::tool {
namespace {

template <class Model>
std::unique_ptr<SessionModel> make(GestureState&) {
  return std::make_unique<Model>();
}

struct ModelRow {
  std::string_view sensor;
  std::unique_ptr<SessionModel> (*make)(GestureState&);
};
// Sensors without a row deliver every record.
constexpr ModelRow kModels[] = {
    {"PHYAC", make<ActivityModel>},
    {"STAP", make<ClassSetModel>},
    {"GSFLK", make<ClassNumberModel<int16_t>>},
    {"ISACT", make<ClassNumberModel<int32_t>>},
    {"SCOUN", make<StepCountModel>},
    {"GSPX",
     [](GestureState& state) -> std::unique_ptr<SessionModel> { return std::make_unique<GestureModel>(state); }},
    {"DTWGS", make<ClassSetModel>},
    {"GSETH", make<ClassNumberModel<int16_t>>},
    {"PDR", make<GatheringModel>},
};

}  // namespace

std::unique_ptr<SessionModel> makeSessionModel(const RecordLayout& sensor, GestureState& gestures) {
  for (const ModelRow& row : kModels) {
    if (row.sensor == sensor.sensor) return row.make(gestures);
  }
  return std::make_unique<EverythingModel>();
}

}  // namespace senseloom::tool
