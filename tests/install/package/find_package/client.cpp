// A client of an installed library. The audio and the gesture sensor reach for the libraries of the platform.
#include <senseloom.hpp>

int main() {
  using senseloom::Session;
  auto audio = Session::open("LPE_P");
  auto gesture = Session::open("GSPX");
  if (!audio || !gesture || !gIsActivated) return 1;
  const auto negotiated = audio.setOption(R"({"interval": 1000})");
  if (!negotiated || negotiated.properties.size() != 1 || negotiated.properties[0].asInt() != 1000) return 2;
  if (audio.close().outcome != senseloom::CloseOutcome::sensorStopped || gIsActivated) return 3;
  return 0;
}
