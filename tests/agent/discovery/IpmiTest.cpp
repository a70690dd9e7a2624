// The management controller: what the kernel shows of it, what it answers itself, and what it may answer
// wrongly.
#include "Machine.h"

#include <agent/discovery/ipmi/DeviceId.h>

#include <gtest/gtest.h>

#include <array>
#include <cerrno>
#include <condition_variable>
#include <deque>
#include <initializer_list>
#include <mutex>

namespace agent::discovery::test {
namespace {

using namespace std::chrono_literals;
using Bytes = std::vector<std::byte>;

Bytes bytesOf(std::initializer_list<unsigned> values) {
  Bytes bytes;
  for (const unsigned value : values) {
    bytes.push_back(static_cast<std::byte>(value));
  }
  return bytes;
}

constexpr unsigned char answerFunction = 0x07;
constexpr unsigned char deviceIdCommand = 0x01;

/// Get Device ID's answer of a controller with revision 2.50 (BCD 0x50) and auxiliary bytes 01 a0 00 00.
const Bytes goodAnswer =
    bytesOf({0x00, 0x20, 0x81, 0x02, 0x50, 0x02, 0xbf, 0x57, 0x01, 0x00, 0x49, 0x00, 0x01, 0xa0, 0x00, 0x00});

IpmiChannel::Received answer(long id, Bytes bytes) {
  return {0, true, id, answerFunction, deviceIdCommand, std::move(bytes)};
}

/// What a controller does after it was asked. The messages come one after the other; then it keeps silent.
struct Script {
  int sendError = 0;
  int awaitError = 0;
  std::deque<IpmiChannel::Received> messages;  ///< an answer's id is added to that of the question
  bool repeatLast = false;
};

class ScriptedChannel : public IpmiChannel {
 public:
  explicit ScriptedChannel(Script script) : script_(std::move(script)) {}

  int send(const Request& request) override {
    EXPECT_EQ(request.function, 0x06);
    EXPECT_EQ(request.command, deviceIdCommand);
    id_ = request.id;
    return script_.sendError;
  }
  int awaitMessage(std::chrono::milliseconds limit) override {
    EXPECT_GT(limit.count(), 0);
    EXPECT_LE(limit, 3s);
    return script_.messages.empty() ? ETIMEDOUT : script_.awaitError;
  }
  Received receive() override {
    Received message = script_.messages.front();
    if (!script_.repeatLast || script_.messages.size() > 1) {
      script_.messages.pop_front();
    }
    message.id += id_;
    return message;
  }

 private:
  Script script_;
  long id_ = 0;
};

IpmiOpener opening(const Script& script) {
  return [script] { return OpenedIpmi{std::make_unique<ScriptedChannel>(script), 0}; };
}

NodeTree discoverWith(const Machine& machine, IpmiOpener ipmi,
                      std::chrono::milliseconds deadline = std::chrono::seconds(60)) {
  DiscoveryOptions options;
  options.root = machine.root();
  options.deadline = deadline;
  options.ipmi = std::move(ipmi);
  return discover(options);
}

SourceReport reportOfAnswer(const Script& script) {
  const Machine machine("");
  const NodeTree tree = discoverWith(machine, opening(script));
  EXPECT_EQ(described(tree, "BMC Firmware"), NodeTree::none);
  const auto report = reportOn(tree, "ipmi", "dev/ipmi0");
  EXPECT_TRUE(report);
  return report.value_or(SourceReport{});
}

TEST(DeviceIdBytes, MinorRevisionIsBcd) {
  const auto firmware = parseDeviceId(std::span(goodAnswer).subspan(1));
  ASSERT_TRUE(firmware);
  EXPECT_EQ(firmware->version, "2.50");
  EXPECT_EQ(firmware->major, 2U);
  EXPECT_EQ(firmware->minor, 50U);
}

TEST(DeviceIdBytes, AuxiliaryBytesStandInTheirOrder) {
  const auto firmware = parseDeviceId(std::span(goodAnswer).subspan(1));
  ASSERT_TRUE(firmware);
  EXPECT_EQ(firmware->auxiliary, "01 a0 00 00");
  EXPECT_EQ(firmware->otherForms, (std::vector<std::string>{"2.50.01", "2.50.01.a0.00.00"}));
}

TEST(DeviceIdBytes, HighestBitOfTheMajorRevisionIsNoPartOfIt) {
  const auto firmware = parseDeviceId(bytesOf({0x20, 0x01, 0x8c, 0x07, 0x02}));
  ASSERT_TRUE(firmware);
  EXPECT_EQ(firmware->version, "12.07");
  EXPECT_EQ(firmware->major, 12U);
  EXPECT_EQ(firmware->auxiliary, std::nullopt);
  EXPECT_TRUE(firmware->otherForms.empty());
}

TEST(DeviceIdBytes, MinorRevisionThatIsNoBcdIsNoNumber) {
  const auto firmware = parseDeviceId(bytesOf({0x20, 0x01, 0x02, 0x1f, 0x02}));
  ASSERT_TRUE(firmware);
  EXPECT_EQ(firmware->version, "2.1f");
  EXPECT_EQ(firmware->minor, std::nullopt);
}

TEST(DeviceIdBytes, TooFewAreNone) {
  for (std::size_t length = 0; length < goodAnswer.size() - 1; ++length) {
    const auto firmware = parseDeviceId(std::span(goodAnswer).subspan(1, length));
    ASSERT_EQ(firmware.has_value(), length >= 5) << length;
    EXPECT_TRUE(!firmware || !firmware->auxiliary) << length << ": the last byte is missing";
  }
}

TEST(ControllerRevisionText, SysfsPrintsAuxiliaryBytesInReverse) {
  const auto firmware = parseRevisionText("2.50", "0x00 0x00 0xa0 0x01");
  ASSERT_TRUE(firmware);
  EXPECT_EQ(firmware->auxiliary, "01 a0 00 00");
}

TEST(ControllerRevisionText, LeadingZeroOfTheMinorRevisionComesBack) {
  const auto firmware = parseRevisionText("2.5", std::nullopt);
  ASSERT_TRUE(firmware);
  EXPECT_EQ(firmware->version, "2.05");
  EXPECT_EQ(firmware->minor, 5U);
  EXPECT_EQ(parseRevisionText("130.10", std::nullopt)->version, "2.10") << "the bit is shown as well";
}

TEST(ControllerRevisionText, OtherFormsAreNone) {
  for (const char* text : {"", ".", "2", "2.", ".5", "256.5", "2.123", "2.g", "-2.5", "2. 5", "2.5.1"}) {
    EXPECT_FALSE(parseRevisionText(text, std::nullopt)) << text;
  }
  for (const char* auxiliary : {"", "0x01", "0x01 0x02 0x03", "0x01 0x02 0x03 0x04 0x05", "01 02 03 04",
                                "0x01,0x02,0x03,0x04", "0x01 0x02 0x03 0xgg", "0x01 0x02 0x03 0x04 "}) {
    const auto firmware = parseRevisionText("1.0", auxiliary);
    ASSERT_TRUE(firmware) << auxiliary;
    EXPECT_EQ(firmware->auxiliary, std::nullopt) << auxiliary;
  }
}

constexpr std::string_view controller = R"(
  sys/bus/platform/devices/ipmi_bmc.0 -> ../../../devices/platform/ipmi_bmc.0
  sys/devices/platform/ipmi_bmc.0/firmware_revision = 2.5
  sys/devices/platform/ipmi_bmc.0/aux_firmware_revision = 0x00 0x00 0xa0 0x01
)";

TEST(IpmiSource, TheKernelsAttributesTellWithoutAQuestion) {
  const Machine machine(controller);
  const NodeTree tree = discoverWith(machine, []() -> OpenedIpmi {
    ADD_FAILURE() << "the controller was asked";
    return {nullptr, ENOENT};
  });
  EXPECT_EQ(shown(tree), R"(40 Computer System
  3 BMC Firmware 104=2 107=5 171="01 a0 00 00" 307="2.05"
)");
  const NodeTree::Index firmware = described(tree, "BMC Firmware");
  ASSERT_NE(firmware, NodeTree::none);
  EXPECT_EQ(tree.parent(firmware), 0U) << "the computer";
  EXPECT_EQ(tree.number(firmware), numberFor(Oru::NodeLexicon::FirmwareNode, "bmc"));
}

TEST(IpmiSource, SeveralControllersStandInTheKernelsOrder) {
  const Machine machine(R"(
    sys/bus/platform/devices/ipmi_bmc.10/firmware_revision = 10.0
    sys/bus/platform/devices/ipmi_bmc.9/firmware_revision = 9.0
    sys/bus/platform/devices/ipmi_si.0/firmware_revision = 7.0
  )");
  EXPECT_EQ(shown(discoverAt(machine)), R"(40 Computer System
  3 BMC Firmware 104=9 107=0 307="9.00"
  3 BMC Firmware 104=10 107=0 307="10.00"
)");
}

TEST(IpmiSource, WithoutAttributesTheControllerIsAsked) {
  const Machine machine("");
  const NodeTree tree = discoverWith(machine, opening({0, 0, {answer(0, goodAnswer)}}));
  EXPECT_EQ(shown(tree), R"(40 Computer System
  3 BMC Firmware 104=2 107=50 171="01 a0 00 00" 307="2.50"
)");
  EXPECT_EQ(tree.number(described(tree, "BMC Firmware")), numberFor(Oru::NodeLexicon::FirmwareNode, "bmc"))
      << "the same element, whoever tells";
}

TEST(IpmiSource, AnAttributeThatSaysNothingLeadsToTheQuestion) {
  const Machine machine("sys/bus/platform/devices/ipmi_bmc.0/firmware_revision = broken");
  const NodeTree tree = discoverWith(machine, opening({0, 0, {answer(0, goodAnswer)}}));
  EXPECT_NE(described(tree, "BMC Firmware"), NodeTree::none);
  const auto report = reportOn(tree, "ipmi", "firmware_revision");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Unreadable);
}

TEST(IpmiSource, EventsAndLateAnswersToOthersArePassedOver) {
  Script script;
  script.messages = {{0, false, 0, 0x04, 0x02, bytesOf({0x00})},
                     answer(17, goodAnswer),
                     {0, true, 0, 0x07, 0x02, bytesOf({0x00, 1, 2, 3, 4, 5, 6, 7})},
                     {0, true, 0, 0x0b, deviceIdCommand, bytesOf({0x00, 1, 2, 3, 4, 5, 6, 7})},
                     {EAGAIN, false, 0, 0, 0, {}},
                     answer(0, goodAnswer)};
  const Machine machine("");
  const NodeTree tree = discoverWith(machine, opening(script));
  ASSERT_EQ(tree.ofType(Oru::NodeLexicon::FirmwareNode).size(), 1U);
  EXPECT_EQ(tree.text(described(tree, "BMC Firmware"), Oru::NodeLexicon::VersionStringProperty), "2.50");
}

TEST(IpmiSource, AControllerThatNeverAnswersIsReported) {
  const SourceReport report = reportOfAnswer({});
  EXPECT_EQ(report.reason, SourceReport::Reason::TimedOut);
  EXPECT_EQ(report.detail, "the controller did not answer within 3000 ms");
}

TEST(IpmiSource, AControllerThatAnswersOtherQuestionsForEverIsLeft) {
  Script script;
  script.messages = {answer(17, goodAnswer)};
  script.repeatLast = true;
  const SourceReport report = reportOfAnswer(script);
  EXPECT_EQ(report.reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(report.detail, "only messages came that do not answer the question");
}

TEST(IpmiSource, WrongAnswersAreReportedAsTheyAre) {
  const SourceReport busy = reportOfAnswer({0, 0, {answer(0, bytesOf({0xd5}))}});
  EXPECT_EQ(busy.reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(busy.detail, "the controller answered with completion code 0xd5");
  const SourceReport silent = reportOfAnswer({0, 0, {answer(0, bytesOf({0xc3}))}});
  EXPECT_EQ(silent.reason, SourceReport::Reason::TimedOut);
  const SourceReport cut = reportOfAnswer({0, 0, {answer(0, bytesOf({0x00, 0x20, 0x01, 0x02, 0x50}))}});
  EXPECT_EQ(cut.reason, SourceReport::Reason::Unreadable);
  EXPECT_EQ(cut.detail, "only 5 bytes came");
  EXPECT_EQ(reportOfAnswer({0, 0, {answer(0, {})}}).detail, "the answer is empty");
}

TEST(IpmiSource, FailuresOfTheDeviceBearTheSystemsWords) {
  EXPECT_EQ(reportOfAnswer({EIO, 0, {}}).detail, "Input/output error");
  EXPECT_EQ(reportOfAnswer({0, EIO, {answer(0, goodAnswer)}}).detail, "Input/output error");
  EXPECT_EQ(reportOfAnswer({0, 0, {{EIO, false, 0, 0, 0, {}}}}).detail, "Input/output error");
}

TEST(IpmiSource, WithoutRootThatIsSaid) {
  const Machine machine("");
  const NodeTree tree = discoverWith(machine, [] { return OpenedIpmi{nullptr, EACCES}; });
  const auto report = reportOn(tree, "ipmi", "/dev/ipmi0");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::NoPermission);
}

TEST(IpmiSource, AMachineWithoutAControllerIsNothingToReport) {
  const Machine machine("");
  const NodeTree tree = discoverWith(machine, [] { return OpenedIpmi{nullptr, ENOENT}; });
  EXPECT_FALSE(reportOn(tree, "ipmi", ""));
  EXPECT_FALSE(reportOn(discoverAt(machine), "ipmi", ""));
}

TEST(IpmiSource, AnotherRootAsksNoIoctlAndSaysSo) {
  const Machine machine("sys/class/ipmi/ipmi0/");
  const auto report = reportOn(discoverAt(machine), "ipmi", "dev/ipmi0");
  ASSERT_TRUE(report);
  EXPECT_EQ(report->reason, SourceReport::Reason::Absent);
}

/// Hangs in a call that should have an end, until the test lets it go; then the test waits for its end.
struct Gate {
  std::mutex mutex;
  std::condition_variable changed;
  bool open = false;
  bool passed = false;
};

class HangingChannel : public IpmiChannel {
 public:
  explicit HangingChannel(std::shared_ptr<Gate> gate) : gate_(std::move(gate)) {}
  ~HangingChannel() override {
    const std::lock_guard lock(gate_->mutex);
    gate_->passed = true;
    gate_->changed.notify_all();
  }
  int send(const Request& /*request*/) override {
    std::unique_lock lock(gate_->mutex);
    gate_->changed.wait(lock, [this] { return gate_->open; });
    return EIO;
  }
  int awaitMessage(std::chrono::milliseconds /*limit*/) override { return ETIMEDOUT; }
  Received receive() override { return {}; }

 private:
  std::shared_ptr<Gate> gate_;
};

TEST(IpmiSource, ADriverThatHangsHoldsNobodyUp) {
  const auto gate = std::make_shared<Gate>();
  const Machine machine("proc/sys/kernel/hostname = up");
  const NodeTree tree = discoverWith(
      machine,
      [gate] {
        return OpenedIpmi{std::make_unique<HangingChannel>(gate), 0};
      },
      2s);
  const auto report = reportOn(tree, "ipmi", "Get Device ID on " + machine.root().string() + "/dev/ipmi0");
  EXPECT_TRUE(report && report->reason == SourceReport::Reason::TimedOut);
  EXPECT_EQ(tree.text(0, Oru::NodeLexicon::NameProperty), "up");
  std::unique_lock lock(gate->mutex);
  gate->open = true;
  gate->changed.notify_all();
  gate->changed.wait(lock, [&] { return gate->passed; });
}

}  // namespace
}  // namespace agent::discovery::test
