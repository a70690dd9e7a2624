// Generic netlink and devlink over bytes: requests, answers, and what is none.
#include "DevlinkBytes.h"

#include <agent/discovery/network/Devlink.h>
#include <agent/discovery/network/Netlink.h>

#include <linux/devlink.h>
#include <linux/genetlink.h>
#include <linux/netlink.h>

#include <gtest/gtest.h>

#include <bit>
#include <cerrno>

namespace agent::discovery::test {
namespace {

using Script = ScriptedNetlink::Script;
using Received = NetlinkChannel::Received;

TEST(NetlinkRequest, IsWrittenByteByByte) {
  static_assert(std::endian::native == std::endian::little, "the bytes below are those of such a machine");
  netlink::Request request(0x1b, 7, DEVLINK_CMD_INFO_GET);
  request.addText(DEVLINK_ATTR_BUS_NAME, "pci").addText(DEVLINK_ATTR_DEV_NAME, "0000:03:00.0");
  EXPECT_EQ(request.bytes(), bytesOfHex("30 00 00 00  1b 00 01 00  07 00 00 00  00 00 00 00"
                                        "33 01 00 00"
                                        "08 00 01 00  70 63 69 00"
                                        "11 00 02 00  30 30 30 30 3a 30 33 3a 30 30 2e 30 00 00 00 00"));
}

TEST(NetlinkRequest, TextThatIsTooLongForAnAttributeIsCut) {
  netlink::Request request(0x1b, 7, 1);
  request.addText(1, std::string(100000, 'x'));
  std::string_view bytes = request.bytes();
  const auto message = netlink::takeMessage(bytes);
  ASSERT_TRUE(message);
  EXPECT_EQ(bytes, "");
  EXPECT_EQ(netlink::textOf(netlink::findAttribute(message->payload.substr(4), 1).value_or("")),
            std::string(65530, 'x'));
}

TEST(NetlinkMessages, AreTakenOneByOne) {
  const std::string bytes = message(5, 1, "abcde") + message(6, 2, "");
  std::string_view rest = bytes;
  const auto first = netlink::takeMessage(rest);
  ASSERT_TRUE(first);
  EXPECT_EQ(first->type, 5);
  EXPECT_EQ(first->sequence, 1U);
  EXPECT_EQ(first->payload, "abcde");
  const auto second = netlink::takeMessage(rest);
  ASSERT_TRUE(second);
  EXPECT_EQ(second->type, 6);
  EXPECT_EQ(second->payload, "");
  EXPECT_FALSE(netlink::takeMessage(rest));
}

TEST(NetlinkMessages, ThatAreCutOrClaimAnotherLengthAreNone) {
  const std::string whole = message(5, 1, "abcd");
  for (std::size_t length = 0; length < whole.size(); ++length) {
    std::string_view cut = std::string_view(whole).substr(0, length);
    EXPECT_FALSE(netlink::takeMessage(cut)) << length;
  }
  for (const std::uint32_t claimed : {0U, 15U, 21U, 0xffffffffU}) {
    const std::string bytes = number32(claimed) + whole.substr(4);
    std::string_view rest = bytes;
    EXPECT_FALSE(netlink::takeMessage(rest)) << claimed;
  }
}

TEST(NetlinkAttributes, ThatAreCutOrClaimAnotherLengthAreNone) {
  const std::string whole = attribute(9, "abcd");
  EXPECT_EQ(netlink::findAttribute(whole, 9), "abcd");
  EXPECT_EQ(netlink::findAttribute(whole, 8), std::nullopt);
  for (std::size_t length = 0; length < whole.size(); ++length) {
    EXPECT_FALSE(netlink::findAttribute(std::string_view(whole).substr(0, length), 9)) << length;
  }
  EXPECT_FALSE(netlink::findAttribute(bytesOfHex("03 00 09 00 61 62 63 64"), 9));
  EXPECT_FALSE(netlink::findAttribute(bytesOfHex("00 00 00 00 08 00 09 00 61 62 63 64"), 9))
      << "a length of 0 leads nowhere";
}

TEST(NetlinkAttributes, FlagsOfATypeAreNoPartOfIt) {
  EXPECT_EQ(netlink::findAttribute(attribute(9 | NLA_F_NESTED | NLA_F_NET_BYTEORDER, "abcd"), 9), "abcd");
}

TEST(NetlinkErrors, AreErrnoValues) {
  EXPECT_EQ(netlink::errorOf(number32(static_cast<std::uint32_t>(-ENODEV))), ENODEV);
  EXPECT_EQ(netlink::errorOf(number32(0)), 0);
  for (const std::uint32_t odd : {1U, 0x80000000U, static_cast<std::uint32_t>(-4096)}) {
    EXPECT_EQ(netlink::errorOf(number32(odd)), EBADMSG) << odd;
  }
  EXPECT_EQ(netlink::errorOf("\1\1\1"), EBADMSG);
}

TEST(DevlinkInfo, HasThreeKindsOfVersionsInTheOrderOfTheDriver) {
  const DevlinkInfo info = parseDevlinkInfo(devlinkAttributes(
      "fixed board.id=K91258-000;running fw.mgmt=7.1.2;running fw.undi=1.29;stored fw.undi=1.30"));
  EXPECT_EQ(info.fixed, (std::vector<DevlinkVersion>{{"board.id", "K91258-000"}}));
  EXPECT_EQ(info.running, (std::vector<DevlinkVersion>{{"fw.mgmt", "7.1.2"}, {"fw.undi", "1.29"}}));
  EXPECT_EQ(info.stored, (std::vector<DevlinkVersion>{{"fw.undi", "1.30"}}));
}

TEST(DevlinkInfo, VersionsThatSayNothingAreAbsent) {
  const DevlinkInfo info = parseDevlinkInfo(devlinkAttributes(
      "running fw=;running fw.a=N/A;running =1;running fw.b=To be filled by O.E.M.;running fw.c=1"));
  EXPECT_EQ(info.running, (std::vector<DevlinkVersion>{{"fw.c", "1"}}));
  EXPECT_EQ(info.runningTexts, (std::vector<std::string>{"", "N/A", "1", "To be filled by O.E.M.", "1"}));
}

TEST(DevlinkInfo, OfOneNameTheFirstVersionStands) {
  EXPECT_EQ(parseDevlinkInfo(devlinkAttributes("running fw=1;running fw=2")).running,
            (std::vector<DevlinkVersion>{{"fw", "1"}}));
}

TEST(DevlinkInfo, ThatIsCutHasWhatWasWhole) {
  const std::string whole = devlinkAttributes("running fw=1;running fw.mgmt=2");
  const std::size_t first = devlinkAttributes("running fw=1").size();
  for (std::size_t length = 0; length < whole.size(); ++length) {
    const DevlinkInfo info = parseDevlinkInfo(std::string_view(whole).substr(0, length));
    EXPECT_EQ(info.running.size(), length < first ? 0U : 1U) << length;
  }
}

/// A conversation in which the answers are those of the script.
Devlink::Answer asked(const std::shared_ptr<Script>& script) {
  Devlink devlink(std::make_unique<ScriptedNetlink>(script), std::chrono::seconds(60));
  return devlink.info("pci", "0000:03:00.0");
}

std::string infoAnswer(std::uint32_t sequence, std::string_view lines) {
  return message(devlinkFamily, sequence, generic(DEVLINK_CMD_INFO_GET) + devlinkAttributes(lines));
}

TEST(DevlinkQuestion, AsksForTheFamilyOnceAndForEachDevice) {
  const auto script = std::make_shared<Script>();
  script->answers = {
      {0, familyAnswer(1)}, {0, infoAnswer(2, "running fw=1")}, {0, infoAnswer(3, "running fw=2")}};
  Devlink devlink(std::make_unique<ScriptedNetlink>(script), std::chrono::seconds(60));
  EXPECT_EQ(devlink.info("pci", "a").info.running, (std::vector<DevlinkVersion>{{"fw", "1"}}));
  EXPECT_EQ(devlink.info("pci", "b").info.running, (std::vector<DevlinkVersion>{{"fw", "2"}}));
  ASSERT_EQ(script->requests.size(), 3U);
  EXPECT_NE(script->requests[0].find("devlink"), std::string::npos);
}

TEST(DevlinkQuestion, MessagesThatAreNoAnswerToItArePassedOver) {
  const auto script = std::make_shared<Script>();
  script->answers = {{0, familyAnswer(1)},
                     {0, infoAnswer(1, "running fw=late") + message(NLMSG_NOOP, 2, "")},
                     {0, errorMessage(2, 0)},
                     {0, errorMessage(9, EIO) + infoAnswer(2, "running fw=1")}};
  const Devlink::Answer answer = asked(script);
  EXPECT_EQ(answer.error, 0);
  EXPECT_EQ(answer.info.running, (std::vector<DevlinkVersion>{{"fw", "1"}}));
}

TEST(DevlinkQuestion, NoNumberOfOtherMessagesKeepsItWaiting) {
  const auto script = std::make_shared<Script>();
  script->answers = {{0, familyAnswer(1)}};
  script->answers.insert(script->answers.end(), 1000, Received{0, infoAnswer(1, "running fw=1")});
  EXPECT_EQ(asked(script).error, EBADMSG);
  EXPECT_EQ(script->awaited, 65);
}

TEST(DevlinkQuestion, ErrorsAreThoseOfTheKernelOrTheSocket) {
  const auto script = std::make_shared<Script>();
  EXPECT_EQ(asked(script).error, ETIMEDOUT);
  script->answers = {{0, errorMessage(1, ENOENT)}};
  EXPECT_EQ(asked(script).error, ENOENT);
  script->answers = {{0, familyAnswer(1)}, {0, errorMessage(2, EOPNOTSUPP)}};
  EXPECT_EQ(asked(script).error, EOPNOTSUPP);
  script->answers = {{EMSGSIZE, ""}};
  EXPECT_EQ(asked(script).error, EMSGSIZE);
  script->sendError = ECONNREFUSED;
  EXPECT_EQ(asked(script).error, ECONNREFUSED);
}

TEST(DevlinkQuestion, BrokenAnswersAreToldFromEmptyOnes) {
  const auto script = std::make_shared<Script>();
  script->answers = {{0, message(GENL_ID_CTRL, 1, generic(CTRL_CMD_NEWFAMILY))}};
  EXPECT_EQ(asked(script).error, EBADMSG) << "a family without its number";
  script->answers = {{0, familyAnswer(1)}, {0, message(devlinkFamily, 2, "abc")}};
  EXPECT_EQ(asked(script).error, EBADMSG) << "too short for its head";
  script->answers = {{0, familyAnswer(1)}, {0, message(devlinkFamily, 2, generic(1))}};
  EXPECT_EQ(asked(script).error, 0) << "a driver that tells nothing";
}

TEST(DevlinkQuestion, TheTimeOfAnAnswerIsBounded) {
  /// Each message is there at once, and none is the answer.
  class Endless : public ScriptedNetlink {
   public:
    Endless() : ScriptedNetlink(std::make_shared<Script>()) {}
    int await(std::chrono::milliseconds limit) override {
      EXPECT_GT(limit.count(), 0);
      return 0;
    }
    Received receive() override { return {0, message(1, 99, "")}; }
  };
  Devlink devlink(std::make_unique<Endless>(), std::chrono::milliseconds(0));
  EXPECT_EQ(devlink.info("pci", "a").error, ETIMEDOUT);
}

TEST(KernelNetlinkTest, TheRunningKernelKnowsNoSuchDevice) {
  OpenedNetlink opened = kernelNetlink()();
  ASSERT_TRUE(opened.channel) << opened.error;
  Devlink devlink(std::move(opened.channel), std::chrono::seconds(10));
  const int error = devlink.info("no-such-bus", "no-such-device").error;
  EXPECT_TRUE(error == ENODEV || error == ENOENT) << error;  // ENOENT: a kernel without devlink
}

TEST(KernelNetlinkTest, NothingComesThatWasNotAskedFor) {
  OpenedNetlink opened = kernelNetlink()();
  ASSERT_TRUE(opened.channel) << opened.error;
  EXPECT_EQ(opened.channel->await(std::chrono::milliseconds(1)), ETIMEDOUT);
  EXPECT_EQ(opened.channel->receive().error, EAGAIN);
}

}  // namespace
}  // namespace agent::discovery::test
