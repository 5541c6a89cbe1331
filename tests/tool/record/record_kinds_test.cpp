#include <gtest/gtest.h>
#include <sys/stat.h>
#include <unistd.h>

#include <cstdlib>
#include <filesystem>
#include <string>

#include "recording.h"

namespace senseloom::tool {
namespace {

// What is recorded of the sessions that each of the programs has. The gesture engine's script begins with that name.
constexpr char kSessions[] = R"({"call":"open","session":"s1","sensor":"LPE_P","returned":"handle"}
{"call":"dispatch","session":"s1","record":{"hex":"01000000000000000200"},"returned":1,"result":{"hex":"01000000000000000200"}}
{"call":"close","session":"s1","returned":0}
{"call":"open","session":"s2","sensor":"GSPX","returned":"handle"}
{"call":"dispatch","session":"s2","record":{"hex":"010000000000000000000c00000000000000000000000000"},"engine":[{"group":0,"name":"NumberOne "}],"returned":1,"result":{"hex":"010000000000000001000c00000000000000000000000000"}}
{"call":"close","session":"s2","returned":0}
)";

Environment withLibraryFolder() {
  return {{"LD_LIBRARY_PATH", std::filesystem::path(LIBRARY_FILE).parent_path()}};
}

void expectRecorded(const std::vector<std::string>& command, const Environment& environment = {}) {
  const ScratchFile trace("kind");
  const ToolRun run = recordTo(trace.name, command, "", environment);
  EXPECT_EQ(run.status, 0) << run.err;
  EXPECT_EQ(callsOf(contentOf(trace.name)), kSessions);
  EXPECT_EQ(check(trace.name).out, "6 calls compared, all as recorded\n");
}

TEST(RecordKinds, ALibraryThatIsLoadedByItsName) {
  expectRecorded({LOADER_FILE, LIBRARY_NAME}, withLibraryFolder());
}

TEST(RecordKinds, ALibraryThatIsLoadedByItsPath) {
  expectRecorded({LOADER_FILE, LIBRARY_FILE});
}

TEST(RecordKinds, ALibraryThatIsBoundDeeply) {
#ifdef SANITIZED
  GTEST_SKIP() << "the sanitizer refuses that";
#endif
  expectRecorded({LOADER_FILE, LIBRARY_FILE, "deep"});
  expectRecorded({LOADER_FILE, PLUGIN_FILE, "deep"});
}

TEST(RecordKinds, ALibraryThatIsSeenByEverybody) {
  expectRecorded({LOADER_FILE, LIBRARY_FILE, "global"});
}

TEST(RecordKinds, ALibraryThatAPlugInNeeds) {
  expectRecorded({LOADER_FILE, PLUGIN_FILE});
}

TEST(RecordKinds, AProgramThatAScriptStarts) {
  expectRecorded({"sh", "-c", std::string(LOADER_FILE) + " " + LIBRARY_FILE});
}

TEST(RecordKinds, ALibraryThatPythonLoads) {
#ifdef SANITIZED
  GTEST_SKIP() << "the program does not have the sanitizer that the library needs";
#endif
  if (sizeof(void*) != 8) GTEST_SKIP() << "Python has the host's word size";
  const std::string program = std::string("import ctypes\nlibrary = ctypes.CDLL('") + LIBRARY_FILE + R"(')
library.ctx_open_session.restype = ctypes.c_void_p
for sensor, digits in (b'LPE_P', '01000000000000000200'), (b'GSPX', '010000000000000000000c00' + 24 * '0'):
    session = ctypes.c_void_p(library.ctx_open_session(sensor))
    record = ctypes.create_string_buffer(bytes.fromhex(digits), len(digits) // 2)
    result, size = ctypes.c_void_p(), ctypes.c_int()
    library.ctx_dispatch_data(session, record, len(digits) // 2, ctypes.byref(result), ctypes.byref(size))
    assert ctypes.c_bool.in_dll(library, 'gIsActivated').value == (sensor == b'LPE_P')
    library.ctx_close_session(session, ctypes.byref(result))
)";
  expectRecorded({"/usr/bin/python3", "-c", program});
}

// As on a device: nothing is loaded by the linker's auditing interface, the files have each other's names.
TEST(RecordKinds, ALibraryThatTheRecordingLibraryStandsInThePlaceOf) {
  const ScratchFolder folder("in_place");
  std::filesystem::create_symlink(RECORDER_LIBRARY, folder.file(LIBRARY_NAME));
  std::filesystem::create_symlink(LIBRARY_FILE, folder.file("libsenseloom-real.so"));
  Environment environment = recordingEnvironment();
  environment.emplace_back("LD_LIBRARY_PATH", folder.name);
  environment.emplace_back("SENSELOOM_TRACE", folder.file("%p"));
  for (const char* trace : {"audio_classification.jsonl", "gesture_hmm.jsonl"}) {
    const ToolRun run = runTool({"replay", "--quiet", trace}, "", environment);
    EXPECT_EQ(run.status, 0) << run.err;
  }
  auto traces = folder.files();
  std::erase_if(traces, [](const std::string& name) { return name.starts_with("lib"); });
  EXPECT_EQ(traces.size(), 2U);
  for (const std::string& name : traces) EXPECT_EQ(check(folder.file(name)).status, 0);
}

// There the library does not find the recording library's function, and does what it does without it.
TEST(RecordKinds, AProgramThatHasAGestureEngineBeforeTheLibrary) {
  const ScratchFile trace("own_engine");
  const std::string engine = std::filesystem::path(LIBRARY_FILE).parent_path() / "libgesture.so";
  const std::string program = "LD_PRELOAD=" + engine + ' ' + TOOL_FILE + " replay --quiet gesture_hmm.jsonl";
  const ToolRun run = recordTo(trace.name, {"sh", "-c", program});
  EXPECT_EQ(run.out, runTool({"replay", "--quiet", "gesture_hmm.jsonl"}, "", recordingEnvironment()).out) << run.err;
  EXPECT_EQ(contentOf(trace.name).find("engine"), std::string::npos);
  EXPECT_NE(check(trace.name).out.find("does not hold what the platform's gesture engine answered"), std::string::npos);
}

TEST(RecordKinds, RefusesAProgramThatIsLinkedStatically) {
  const ScratchFile trace("static");
  const ToolRun run = recordTo(trace.name, {STATIC_FILE});
  EXPECT_EQ(run.err,
            "senseloom: " + std::string(STATIC_FILE) + ": it is linked statically, so it cannot be recorded\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_FALSE(std::filesystem::exists(trace.name));
}

TEST(RecordKinds, RefusesAProgramThatRunsWithThePrivilegesOfItsFile) {
  if (geteuid() != 0) GTEST_SKIP() << "only root can make a file of somebody else's";
  const ScratchFolder folder("privileged");
  const std::string program = folder.file("program");
  std::filesystem::copy_file(LOADER_FILE, program);
  ASSERT_EQ(chown(program.c_str(), 65534, 65534), 0);
  ASSERT_EQ(chmod(program.c_str(), 04755), 0);
  const ToolRun run = recordTo(folder.file("trace"), {program, LIBRARY_FILE});
  EXPECT_EQ(run.err, "senseloom: " + program + ": it runs with the privileges of its file, so it cannot be recorded\n");
  EXPECT_EQ(run.status, 2);
  EXPECT_FALSE(std::filesystem::exists(folder.file("trace")));
}

}  // namespace
}  // namespace senseloom::tool
