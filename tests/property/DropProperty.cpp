// A programming run over the network whose connection is cut at some byte: one clear error in time, and the next run
// succeeds. `--rounds N --seed S`; ends with 1 and the round's numbers when that does not hold.

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <random>
#include <string>
#include <vector>

#include "interfaces/devicemanager/DeviceManagerInterface.h"
#include "tests/property/Arguments.h"
#include "tests/property/Proxy.h"
#include "tests/unit/support/ChildProcess.h"
#include "tests/unit/support/Files.h"
#include "tests/unit/support/RecordedMessages.h"
#include "tests/unit/support/ScopedVariable.h"

namespace {

using Clock = std::chrono::steady_clock;

constexpr double timeLimit = 12;  ///< seconds: the cable's own limit for an answer, and a little

/// Sixteen pages of 128 bits that program at once.
constexpr const char* part = R"bsdl(entity dart16 is
  generic (PHYSICAL_PIN_MAP : string := "PK");
  port (TCK, TMS, TDI : in bit; TDO : out bit);
  use STD_1149_1_2001.all;
  attribute COMPONENT_CONFORMANCE of dart16 : entity is "STD_1149_1_2001";
  attribute PIN_MAP of dart16 : entity is PHYSICAL_PIN_MAP;
  constant PK : PIN_MAP_STRING := "TCK:1, TMS:2, TDI:3, TDO:4";
  attribute TAP_SCAN_IN of TDI : signal is true;
  attribute TAP_SCAN_MODE of TMS : signal is true;
  attribute TAP_SCAN_OUT of TDO : signal is true;
  attribute TAP_SCAN_CLOCK of TCK : signal is (10.0e6, BOTH);
  attribute INSTRUCTION_LENGTH of dart16 : entity is 8;
  attribute INSTRUCTION_OPCODE of dart16 : entity is
    "BYPASS (11111111), EXTEST (00000000), SAMPLE (00000001), PRELOAD (00000001), IDCODE (00000010)," &
    "ISC_ENABLE (01110100), ISC_DISABLE (10001011), ISC_ERASE (01011001), ISC_ADDRESS_SHIFT (00100110)," &
    "ISC_DATA_SHIFT (11010101), ISC_PROGRAM (10111000), ISC_READ (00111111), ISC_STATUS (11001100)";
  attribute INSTRUCTION_CAPTURE of dart16 : entity is "XXXXXX01";
  attribute IDCODE_REGISTER of dart16 : entity is "XXXX0000110100010110011011111101";
  attribute REGISTER_ACCESS of dart16 : entity is
    "ISC_KEY[8] (ISC_ENABLE, ISC_ERASE), ISC_ADDRESS[8] (ISC_ADDRESS_SHIFT), ISC_PAGE[128] (ISC_DATA_SHIFT, ISC_READ)," &
    "ISC_STATE[8] (ISC_STATUS)";
  attribute BOUNDARY_LENGTH of dart16 : entity is 1;
  attribute BOUNDARY_REGISTER of dart16 : entity is "0 (BC_1, *, internal, X)";
  attribute ISC_CONFORMANCE of dart16 : entity is "STD_1532_2002";
  attribute ISC_FLOW of dart16 : entity is
    "flow_enable initialize (ISC_ENABLE 8:D0 wait TCK 16)," &
    "flow_disable initialize (ISC_DISABLE wait TCK 16)," &
    "flow_erase initialize (ISC_ERASE 8:A5 wait TCK 16) loop max 20 (ISC_STATUS wait TCK 8 8:00*01)," &
    "flow_program(array) initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait TCK 1) (ISC_DATA_SHIFT 128:? wait TCK 1)" &
    "  (ISC_PROGRAM wait TCK 16)" &
    "  repeat 15 (ISC_ADDRESS_SHIFT 8:$adr+01 wait TCK 1) (ISC_DATA_SHIFT 128:? wait TCK 1) (ISC_PROGRAM wait TCK 16)," &
    "flow_verify(array) initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait TCK 1) (ISC_READ wait TCK 1 128:?)" &
    "  repeat 15 (ISC_ADDRESS_SHIFT 8:$adr+01 wait TCK 1) (ISC_READ wait TCK 1 128:?)," &
    "flow_read(array) initialize (ISC_ADDRESS_SHIFT 8:$adr=00 wait TCK 1) (ISC_READ wait TCK 1 128:!)" &
    "  repeat 15 (ISC_ADDRESS_SHIFT 8:$adr+01 wait TCK 1) (ISC_READ wait TCK 1 128:!)";
  attribute ISC_PROCEDURE of dart16 : entity is
    "proc_enable = (flow_enable), proc_disable = (flow_disable), proc_erase = (flow_erase)," &
    "proc_program(array) = (flow_program(array)), proc_verify(array) = (flow_verify(array))," &
    "proc_read(array) = (flow_read(array))";
  attribute ISC_ACTION of dart16 : entity is
    "erase = (proc_enable, proc_erase, proc_disable)," &
    "program = (proc_enable, proc_erase recommended, proc_program(array), proc_verify(array) optional, proc_disable)," &
    "verify = (proc_enable, proc_verify(array), proc_disable), read = (proc_enable, proc_read(array), proc_disable)";
end dart16;
)bsdl";
constexpr const char* board = R"({
  "name": "dart",
  "chain": [{"bsdl": "dart16.bsd",
             "model": {"pages": 16, "bits": 128, "times": {"program": 1e-7, "erase": 1e-7}}}]
})";

class Session {
 public:
  Session(const testsupport::TemporaryDirectory& directory, std::uint16_t port)
      : server_("127.0.0.1:" + std::to_string(port)), file_(directory.file("data.bin")) {
    manager().setMode(tESSELNS::BOUNDARY_SCAN, true);
    if (!manager().addDeviceByFile(0, directory.file("dart16.bsd").c_str(), nullptr, {})) fail("addDevice");
  }

  ~Session() { DeviceManagerInterface::removeDeviceManager(); }
  Session(const Session&) = delete;
  Session& operator=(const Session&) = delete;

  /// Opens the cable, when it is not, and programs with new data.
  bool program(std::mt19937_64& random) {
    std::string data(256, '\0');
    for (char& each : data) each = static_cast<char>(random());
    testsupport::writeFile(file_, data);
    if (!open_) open_ = manager().setCable("usb", 0, -1, true, server_.c_str(), false) && manager().lockCable(5);
    const char* words[] = {"program", "-p", "0", "-e", "-v", "-file", file_.c_str()};
    return open_ && manager().performOperation(7, words);
  }
  void close() {
    manager().closeCable(false);
    open_ = false;
  }

 private:
  static DeviceManagerInterface& manager() { return *DeviceManagerInterface::getDeviceManager(); }
  [[noreturn]] static void fail(const char* what) {
    std::fprintf(stderr, "%s failed\n", what);
    std::exit(2);
  }

  std::string server_;
  std::string file_;
  bool open_ = false;
};

std::vector<std::string> errorsIn(const std::vector<testsupport::Message>& messages) {
  std::vector<std::string> errors;
  for (const testsupport::Message& message : messages)
    if (message.type == MsgType::error) errors.push_back(message.text);
  return errors;
}

/// What did not hold; empty when all did.
std::string round(Session& session, Proxy& proxy, testsupport::RecordedMessages& messages, std::mt19937_64& random,
                  std::uint64_t cut) {
  session.close();
  messages.take();
  proxy.cutAfter(cut);
  const auto begin = Clock::now();
  const bool survived = session.program(random);
  const std::chrono::duration<double> took = Clock::now() - begin;
  const std::vector<std::string> errors = errorsIn(messages.take());
  proxy.cutAfter(0);
  if (took.count() > timeLimit) return "it took " + std::to_string(took.count()) + " s";
  if (!survived && errors.size() != 1) return "there were " + std::to_string(errors.size()) + " errors";
  if (!survived && errors.front().find("127.0.0.1:") == std::string::npos) return "the error is " + errors.front();
  if (survived && !errors.empty()) return "it succeeded with the error " + errors.front();
  if (!session.program(random)) {
    const std::vector<std::string> later = errorsIn(messages.take());
    return "the next run failed: " + (later.empty() ? "without a word" : later.front());
  }
  return {};
}

}  // namespace

int main(int count, char** words) {
  const property::Arguments arguments(count, words, 100);
  const testsupport::TemporaryDirectory directory;
  const testsupport::ScopedVariable locks("XDG_RUNTIME_DIR", directory.path().c_str());
  testsupport::writeFile(directory.file("dart16.bsd"), part);
  testsupport::writeFile(directory.file("board.json"), board);
  testsupport::ChildProcess server({TESSEL_BOARD, directory.file("board.json"), "--listen", "127.0.0.1:0"});
  const std::string line = server.readLine();
  const int port = std::atoi(line.substr(line.rfind(':') + 1).c_str());
  if (port <= 0) {
    std::fprintf(stderr, "The server says %s\n", line.c_str());
    return 2;
  }
  Proxy proxy(static_cast<std::uint16_t>(port));
  testsupport::RecordedMessages messages;
  Session session(directory, proxy.port());
  std::mt19937_64 random(arguments.seed);
  if (!session.program(random)) {
    for (const std::string& each : errorsIn(messages.take())) std::fprintf(stderr, "%s", each.c_str());
    return 2;
  }
  session.close();
  std::uint64_t whole = 0;
  for (int i = 0; i < 100 && (whole = proxy.sent()) == 0; ++i)
    std::this_thread::sleep_for(std::chrono::milliseconds(20));
  int dropped = 0;
  for (int i = 0; i < arguments.rounds; ++i) {
    const std::uint64_t cut = 1 + random() % whole;
    const std::string problem = round(session, proxy, messages, random, cut);
    if (!problem.empty()) {
      std::fprintf(stderr, "Seed %llu, round %d, cut after byte %llu of %llu: %s\n",
                   static_cast<unsigned long long>(arguments.seed), i, static_cast<unsigned long long>(cut),
                   static_cast<unsigned long long>(whole), problem.c_str());
      return 1;
    }
    ++dropped;
  }
  std::printf("%d connections cut at random bytes of %llu, as it should be\n", dropped,
              static_cast<unsigned long long>(whole));
  return dropped > 0 ? 0 : 1;
}
