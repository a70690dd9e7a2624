// What is no inventory is refused with the line, the field, and what was expected.
#include <agent/framework/InventoryFile.h>

#include <gtest/gtest.h>

#include <ostream>
#include <string>

#include <sys/stat.h>
#include <unistd.h>

namespace agent {
namespace {

struct Case {
  const char* name;
  std::string text;
  std::string message;
};

std::ostream& operator<<(std::ostream& stream, const Case& refused) {
  return stream << refused.name;
}

std::string messageFor(std::string_view text) {
  try {
    parseInventory(text, "server.json");
  } catch (const InventoryError& error) {
    return error.what();
  }
  return "no error";
}

/// An inventory whose nodes start on line 3.
std::string withNodes(const std::string& nodes) {
  return "{\"format\": \"swinv-inventory\",\n\"version\": 1, \"nodes\": [\n" + nodes + "]}";
}

/// One node with that member, on line 3.
std::string withMember(const std::string& member) {
  return withNodes("{\"type\": 3, " + member + "}");
}

class RefusedInventory : public ::testing::TestWithParam<Case> {};

TEST_P(RefusedInventory, IsExplained) {
  EXPECT_EQ(messageFor(GetParam().text), GetParam().message);
}

std::string name(const ::testing::TestParamInfo<Case>& info) {
  return info.param.name;
}

const std::string ids = "expected a text of 1 to 16 hexadecimal digits, neither 0 nor ffffffffffffffff, got ";
const std::string values = "expected a text that is not empty, or a number from 0 to 4294967295, got ";

INSTANTIATE_TEST_SUITE_P(
    Head, RefusedInventory,
    ::testing::Values(
        Case{"NoObject", "[]", "server.json:1: expected an object, got an array"},
        Case{"Number", "\n\n7", "server.json:3: expected an object, got 7"},
        Case{"OtherFormat", "{\"format\":\n \"else\"}",
             "server.json:2: format: expected \"swinv-inventory\", got \"else\""},
        Case{"LaterVersion", "{\"version\": 2}", "server.json:1: version: expected 1, got 2"},
        Case{"VersionText", "{\"version\": \"1\"}", "server.json:1: version: expected 1, got \"1\""},
        Case{"NoFormat", "\n{\"version\": 1, \"nodes\": []\n}",
             "server.json:2: \"format\" is missing; expected \"swinv-inventory\""},
        Case{"NoVersion", "{\"format\": \"swinv-inventory\", \"nodes\": []}",
             "server.json:1: \"version\" is missing; expected 1"},
        Case{"NoNodes", "{\"format\": \"swinv-inventory\", \"version\": 1}",
             "server.json:1: \"nodes\" is missing; expected an array of nodes"},
        Case{"NodesObject", "{\"nodes\": {}}",
             "server.json:1: nodes: expected an array of nodes, got an object"},
        Case{"Unknown", "{\n\"node\": []}",
             "server.json:2: node: unknown member; expected one of format, version, nodes, notRead"},
        Case{"Twice", "{\"version\": 1,\n\n\"version\": 1}", "server.json:3: version: given twice"}),
    name);

INSTANTIATE_TEST_SUITE_P(
    Node, RefusedInventory,
    ::testing::Values(
        Case{"NoObject", withNodes("{\"type\": 3},\n\"x\""),
             "server.json:4: nodes[1]: expected a node (an object), got \"x\""},
        Case{"ArrayInNodes", withNodes("[]"),
             "server.json:3: nodes[0]: expected a node (an object), got an array"},
        Case{"NoType", withNodes("{\"type\": 3}, {\n\"id\": \"5\"\n}"),
             "server.json:3: nodes[1]: \"type\" is missing; expected a node type name or number"},
        Case{
            "UnknownType",
            withNodes("{\"type\": 3},\n{\"type\": 49, \"children\": [\n{\"type\":\n\"Firmwar\"}]}"),
            "server.json:6: nodes[1].children[0].type: expected a node type name or number, got \"Firmwar\""},
        Case{"NegativeType", withNodes("{\"type\": -3}"),
             "server.json:3: nodes[0].type: expected a node type name or number, got a number that is "
             "negative, has a "
             "fraction or is too big"},
        Case{"HugeType", withNodes("{\"type\": 2147483648}"),
             "server.json:3: nodes[0].type: expected a node type name or number, got 2147483648"},
        Case{"NullType", withNodes("{\"type\": null}"),
             "server.json:3: nodes[0].type: expected a node type name or number, got null"},
        Case{"PositionNumber", withMember("\"position\": 5"),
             "server.json:3: nodes[0].position: expected a text, got 5"},
        Case{"DescriptionBool", withMember("\"description\": true"),
             "server.json:3: nodes[0].description: expected a text, got a boolean"},
        Case{"DescriptionArray", withMember("\"description\": []"),
             "server.json:3: nodes[0].description: expected a text, got an array"},
        Case{"ChildrenText", withMember("\"children\": \"none\""),
             "server.json:3: nodes[0].children: expected an array of nodes, got \"none\""},
        Case{"UnknownMember", withMember("\"name\": \"x\""),
             "server.json:3: nodes[0].name: unknown member; expected one of type, position, id, description, "
             "properties, children"},
        Case{"MemberTwice", withMember("\"type\": 3"), "server.json:3: nodes[0].type: given twice"},
        Case{"IdNotHexadecimal", withMember("\"id\": \"xyz\""),
             "server.json:3: nodes[0].id: " + ids + "\"xyz\""},
        Case{"IdNumber", withMember("\"id\": 12"), "server.json:3: nodes[0].id: " + ids + "12"},
        Case{"IdEmpty", withMember("\"id\": \"\""), "server.json:3: nodes[0].id: " + ids + "\"\""},
        Case{"IdZero", withMember("\"id\": \"00\""), "server.json:3: nodes[0].id: " + ids + "\"00\""},
        Case{"IdOverflow", withMember("\"id\": \"FFFFFFFFFFFFFFFF\""),
             "server.json:3: nodes[0].id: " + ids + "\"FFFFFFFFFFFFFFFF\""},
        Case{"IdTooBig", withMember("\"id\": \"10000000000000000\""),
             "server.json:3: nodes[0].id: " + ids + "\"10000000000000000\""},
        Case{"IdTwice", withNodes("{\"type\": 3,\n\"id\": \"1a\"},\n{\"type\": 3, \"id\": \"01A\"}"),
             "server.json:5: nodes[1].id: the number 1a is that of another node already, on server.json:4"},
        Case{"IdOfTheNodeAbove",
             withNodes("{\"type\": 49, \"id\": \"1a\",\n\"children\": [{\"type\": 3, \"children\": [\n"
                       "{\"type\": 3, \"id\": \"1a\"}]}]}"),
             "server.json:5: nodes[0].children[0].children[0].id: the number 1a is that of another node "
             "already, on server.json:3"},
        Case{"IdOfANodeBelow",
             withNodes("{\"type\": 49, \"children\": [{\"type\": 3, \"id\": \"1a\"}],\n\"id\": \"1a\"}"),
             "server.json:4: nodes[0].id: the number 1a is that of another node already, on server.json:3"},
        Case{"LongText", withNodes("{\"type\": \"" + std::string(50, 'x') + "\"}"),
             "server.json:3: nodes[0].type: expected a node type name or number, got \"" +
                 std::string(40, 'x') + "...\""}),
    name);

INSTANTIATE_TEST_SUITE_P(
    Property, RefusedInventory,
    ::testing::Values(
        Case{"Array", withMember("\"properties\": []"),
             "server.json:3: nodes[0].properties: expected an object of properties, got an array"},
        Case{"UnknownName", withMember("\"properties\": {\n\"Versoin\": \"1\"}"),
             "server.json:4: nodes[0].properties.Versoin: expected the name of a property or its number"},
        Case{"NegativeNumber", withMember("\"properties\": {\"-1\": \"1\"}"),
             "server.json:3: nodes[0].properties.-1: expected the name of a property or its number"},
        Case{"NumberNotPlain", withMember("\"properties\": {\"0307\": \"1\"}"),
             "server.json:3: nodes[0].properties.0307: expected the name of a property or its number"},
        Case{"NumberTooBig", withMember("\"properties\": {\"2147483648\": \"1\"}"),
             "server.json:3: nodes[0].properties.2147483648: expected the name of a property or its number"},
        Case{"Twice", withMember("\"properties\": {\"VersionString\": \"1\",\n\"307\": \"1\"}"),
             "server.json:4: nodes[0].properties.307: given twice"},
        Case{"Empty", withMember("\"properties\": {\"Name\": \" \"}"),
             "server.json:3: nodes[0].properties.Name: " + values + "\"\""},
        Case{"Null", withMember("\"properties\": {\"Name\": null}"),
             "server.json:3: nodes[0].properties.Name: " + values + "null"},
        Case{"TooBig", withMember("\"properties\": {\"MajorVersion\": 4294967296}"),
             "server.json:3: nodes[0].properties.MajorVersion: " + values + "4294967296"},
        Case{"Fraction", withMember("\"properties\": {\"MajorVersion\": 1.5}"),
             "server.json:3: nodes[0].properties.MajorVersion: " + values +
                 "a number that is negative, has a fraction or is too big"},
        Case{"Object", withMember("\"properties\": {\"Name\": {}}"),
             "server.json:3: nodes[0].properties.Name: " + values + "an object"}),
    name);

INSTANTIATE_TEST_SUITE_P(
    Report, RefusedInventory,
    ::testing::Values(
        Case{"NoObject", "{\"notRead\": [1]}",
             "server.json:1: notRead[0]: expected a report (an object), got 1"},
        Case{"NoSource", "{\"notRead\": [\n{\"reason\": \"absent\"}]}",
             "server.json:2: notRead[0]: \"source\" is missing; expected a text"},
        Case{"UnknownReason", "{\"notRead\": [{\"source\": \"dmi\", \"reason\": \"gone\"}]}",
             "server.json:1: notRead[0].reason: expected \"absent\", \"noPermission\", \"unreadable\" or "
             "\"timedOut\", "
             "got \"gone\""},
        Case{"UnknownMember", "{\"notRead\": [{\"why\": 1}]}",
             "server.json:1: notRead[0].why: unknown member; expected one of source, path, reason, detail"}),
    name);

TEST(RefusedText, IsExplainedByLineWhereItIsNoJson) {
  EXPECT_EQ(messageFor(""), "server.json:1: not JSON: The document is empty.");
  EXPECT_EQ(messageFor("{\"format\": \"swinv-inventory\"\n\n\"version\"").substr(0, 40),
            "server.json:3: not JSON: Missing a comma");
  EXPECT_EQ(messageFor(withNodes("") + "\n,"),
            "server.json:4: not JSON: The document root must not be followed by other values.");
  EXPECT_EQ(messageFor("{\n\"format\": \"\xFF\"}"), "server.json:2: not JSON: Invalid encoding in string.");
  EXPECT_EQ(messageFor("{\"format\": \"\\ud800\"}").substr(0, 24), "server.json:1: not JSON:");
  EXPECT_EQ(messageFor(withNodes("") + std::string("\n\0x", 3)),
            "server.json:4: not JSON: a zero byte after the inventory");
  EXPECT_EQ(messageFor(std::string("\0", 1)), "server.json:1: not JSON: The document is empty.");
}

/// A wrong type `depth` arrays of children below the first node.
std::string wrongTypeBelow(int depth) {
  std::string nodes;
  for (int i = 0; i < depth; ++i) {
    nodes += "{\"type\": 3, \"children\": [";
  }
  return withNodes(nodes + "{\"type\": 0.5}");
}

TEST(RefusedText, IsExplainedInOneLineHoweverDeepTheField) {
  const std::string expected =
      ": expected a node type name or number, got a number that is negative, has a "
      "fraction or is too big";
  const std::string level = ".children[0]";
  std::string levels;
  for (int i = 0; i < 15; ++i) {
    levels += level;
  }
  // 8 + 15 * 12 + 5 = 193 characters are few enough, 8 + 16 * 12 + 5 = 205 are not.
  EXPECT_EQ(messageFor(wrongTypeBelow(15)), "server.json:3: nodes[0]" + levels + ".type" + expected);
  const std::string sevenLevels = levels.substr(0, 7 * level.size());
  const std::string cut =
      "server.json:3: nodes[0]" + sevenLevels + "\u2026" + sevenLevels + ".type" + expected;
  EXPECT_EQ(messageFor(wrongTypeBelow(16)), cut);
  EXPECT_EQ(messageFor(wrongTypeBelow(60)), cut);
}

TEST(RefusedText, IsExplainedInOneLineHoweverLongTheName) {
  std::string name = "x";
  for (int i = 0; i < 100'000; ++i) {
    name += "\u00e9";
  }
  // Names are cut between characters: 100 bytes from the front end inside one, 100 from the back do not.
  const std::string message = messageFor("{\"" + name + "\": 1}");
  EXPECT_EQ(message, "server.json:1: " + name.substr(0, 99) + "\u2026" + name.substr(name.size() - 100) +
                         ": unknown member; expected one of format, version, nodes, notRead");
}

TEST(RefusedText, IsRefusedBeyondTheBounds) {
  std::string deep;
  for (std::size_t i = 0; i <= InventoryBounds::depth; ++i) {
    deep += "{\"type\": 3, \"children\": [\n";
  }
  const std::string message = messageFor(withNodes(deep));
  EXPECT_NE(message.find("nodes lie at most 64 deep"), std::string::npos) << message;
  EXPECT_EQ(message.substr(0, 15), "server.json:67:");

  std::string properties;
  for (std::size_t i = 0; i <= InventoryBounds::propertiesOfNode; ++i) {
    properties += (i == 0 ? "\"" : ", \"") + std::to_string(2000 + i) + "\": 1";
  }
  EXPECT_EQ(messageFor(withMember("\"properties\": {" + properties + "}")),
            "server.json:3: nodes[0].properties.2256: a node has at most 256 properties");

  // Brackets without end, which a parser that calls itself would not survive.
  EXPECT_NE(messageFor(withMember("\"children\": " + std::string(1'000'000, '['))), "no error");
}

std::string messageForFile(const std::string& path) {
  try {
    readInventoryFile(path);
  } catch (const InventoryError& error) {
    return error.what();
  }
  return "no error";
}

TEST(RefusedFile, IsWhatCouldKeepTheReaderWaiting) {
  const std::string pipe = ::testing::TempDir() + "swinv-pipe-" + std::to_string(::getpid());
  ASSERT_EQ(::mkfifo(pipe.c_str(), 0600), 0);
  EXPECT_EQ(messageForFile(pipe), pipe + ": cannot be read: it is no regular file");
  EXPECT_EQ(::unlink(pipe.c_str()), 0);
  EXPECT_EQ(messageForFile("/dev/zero"), "/dev/zero: cannot be read: it is no regular file");
}

TEST(RefusedFile, IsAFolderOrNone) {
  EXPECT_EQ(messageForFile("/"), "/: cannot be read: Is a directory");
  EXPECT_EQ(messageForFile("/no/such.json"), "/no/such.json: cannot be read: No such file or directory");
}

}  // namespace
}  // namespace agent
