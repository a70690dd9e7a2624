// Enumerations in parts: opened, pulled from, closed, expired.
#include "Fixture.h"

namespace {

using protocol_test::between;
using protocol_test::className;
using protocol_test::Control;
using protocol_test::errorCode;
using protocol_test::flag;
using protocol_test::Given;
using protocol_test::instanceName;
using protocol_test::names;
using protocol_test::outParameter;
using protocol_test::properties;
using protocol_test::Protocol;
using protocol_test::Recorded;
using protocol_test::request;
using protocol_test::Request;
using protocol_test::text;
using protocol_test::texts;
using testing::Contains;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::Not;
using testing::SizeIs;

class Pull : public Protocol {
 protected:
  const Given crowd_{"ClassName", className("TEST_Crowd")};
  const Given item_{"ClassName", className("TEST_Item")};

  static Given most(std::uint32_t count) { return {"MaxObjectCount", text(std::to_string(count))}; }
  static Given context(const std::string& id) { return {"EnumerationContext", text(id)}; }

  /// The crowd's context, with `count` objects taken.
  std::string open(std::uint32_t count = 0, std::vector<Given> more = {}) const {
    more.push_back(crowd_);
    more.push_back(most(count));
    const std::string body = ask("OpenEnumerateInstances", more);
    EXPECT_EQ(outParameter(body, "EndOfSequence"), "FALSE") << body;
    return outParameter(body, "EnumerationContext");
  }
  std::string pull(const std::string& id, std::uint32_t count) const {
    return ask("PullInstancesWithPath", {context(id), most(count)});
  }
  void expectGone(const std::string& id) const {
    expectError(21, "PullInstancesWithPath", {context(id), most(1)});
    expectError(21, "CloseEnumeration", {context(id)});
    expectError(21, "EnumerationCount", {context(id)});
  }
  static bool isEnd(const std::string& body) { return outParameter(body, "EndOfSequence") == "TRUE"; }
};

TEST_F(Pull, openHoldsEverythingThatFits) {
  const std::string body = ask("OpenEnumerateInstances", {item_, most(3)});
  EXPECT_THAT(names(body), ElementsAre("TEST_Item a", "TEST_Item b", "TEST_SubItem s"));
  EXPECT_THAT(between(body, "<VALUE.INSTANCEWITHPATH>", "</VALUE.INSTANCEWITHPATH>"), SizeIs(3));
  EXPECT_THAT(body, HasSubstr("<HOST>server:5988</HOST>"));
  EXPECT_TRUE(isEnd(body));
  EXPECT_EQ(outParameter(body, "EnumerationContext"), "");
  EXPECT_EQ(endpoint_->contexts(), 0U);
  EXPECT_TRUE(isEnd(ask("OpenEnumerateInstances", {item_, most(100)})));
}

TEST_F(Pull, deliversInParts) {
  control_.set(&Control::size, 7);
  const std::string id = open(2);
  EXPECT_EQ(endpoint_->contexts(), 1U);
  std::string body = pull(id, 3);
  EXPECT_THAT(names(body), ElementsAre("TEST_Crowd n2", "TEST_Crowd n3", "TEST_Crowd n4"));
  EXPECT_FALSE(isEnd(body));
  EXPECT_EQ(outParameter(body, "EnumerationContext"), id);
  body = pull(id, 3);
  EXPECT_THAT(names(body), ElementsAre("TEST_Crowd n5", "TEST_Crowd n6"));
  EXPECT_TRUE(isEnd(body));
  EXPECT_EQ(endpoint_->contexts(), 0U);
  expectGone(id);
}

TEST_F(Pull, knowsTheEndWithTheLastObject) {
  control_.set(&Control::size, 4);
  const std::string id = open(2);
  const std::string body = pull(id, 2);
  EXPECT_THAT(names(body), SizeIs(2));
  EXPECT_TRUE(isEnd(body));
}

// Where the provider takes its time a part does not wait until the end is known.
TEST_F(Pull, doesNotWaitLongForWhatComesNext) {
  settings_.lookAhead = std::chrono::milliseconds(1);
  restart();
  control_.set(&Control::allowed, 2);
  const std::string id = open(2);
  ASSERT_TRUE(waitFor(&Control::delivered, 2));
  control_.set(&Control::allowed, Control::all);
  EXPECT_THAT(names(pull(id, 5)), ElementsAre("TEST_Crowd n2"));
}

TEST_F(Pull, withoutObjectsKeepsTheEnumerationAlive) {
  settings_.idleTime = std::chrono::seconds(30);
  restart();
  const std::string id = open();
  for (int times = 0; times < 3; ++times) {
    passed_ = passed_.load() + std::chrono::seconds(29);
    const std::string body = pull(id, 0);
    EXPECT_THAT(names(body), IsEmpty());
    EXPECT_FALSE(isEnd(body));
    EXPECT_THAT(body, HasSubstr("<IRETURNVALUE></IRETURNVALUE>"));
  }
  EXPECT_THAT(names(pull(id, 10)), SizeIs(3));
}

TEST_F(Pull, openTellsTheEndOfNothing) {
  const std::string body = ask("OpenEnumerateInstances", {{"ClassName", className("TEST_Empty")}});
  EXPECT_TRUE(isEnd(body));
  EXPECT_THAT(names(body), IsEmpty());
  EXPECT_EQ(endpoint_->contexts(), 0U);
}

TEST_F(Pull, opensEachKindOfEnumeration) {
  const Given place{"InstanceName", instanceName("TEST_Place", "here")};
  const auto all = [&](const std::string& method, std::vector<Given> parameters) {
    parameters.push_back(most(100));
    const std::string body = ask(method, parameters);
    EXPECT_TRUE(isEnd(body)) << method;
    return body;
  };
  std::string body = all("OpenEnumerateInstancePaths", {item_});
  EXPECT_THAT(names(body), ElementsAre("TEST_Item a", "TEST_Item b", "TEST_SubItem s"));
  EXPECT_THAT(between(body, "<INSTANCEPATH>", "</INSTANCEPATH>"), SizeIs(3));
  EXPECT_THAT(body, Not(HasSubstr("OBJECTPATH")));
  EXPECT_THAT(names(all("OpenAssociatorInstances", {place})), ElementsAre("TEST_Item a", "TEST_SubItem s"));
  EXPECT_THAT(names(all("OpenAssociatorInstancePaths", {place, {"ResultClass", className("TEST_SubItem")}})),
              ElementsAre("TEST_SubItem s"));
  EXPECT_THAT(all("OpenReferenceInstances", {place, {"Role", text("Antecedent")}}),
              HasSubstr("<INSTANCE CLASSNAME=\"TEST_Holds\""));
  EXPECT_THAT(all("OpenReferenceInstancePaths", {place, {"Role", text("Dependent")}}),
              Not(HasSubstr("TEST_Holds")));
  body = all("OpenQueryInstances",
             {{"FilterQueryLanguage", text("WQL")}, {"FilterQuery", text("SELECT * FROM TEST_Item")}});
  EXPECT_THAT(between(body, "<INSTANCE CLASSNAME=\"", "\""), SizeIs(2));
  EXPECT_THAT(body, Not(HasSubstr("VALUE.OBJECT")));
}

TEST_F(Pull, showsThePropertiesThatAreWanted) {
  EXPECT_THAT(properties(ask("OpenEnumerateInstances", {item_, most(9), flag("DeepInheritance", false)})),
              Not(Contains("Extra")));
  EXPECT_THAT(properties(ask("OpenEnumerateInstances", {item_, most(9)})), Contains("Extra"));
  EXPECT_THAT(
      properties(ask("OpenEnumerateInstances", {item_, most(9), {"PropertyList", texts({"Number"})}})),
      ElementsAre("Number", "Number", "Number"));
  EXPECT_THAT(ask("OpenEnumerateInstances", {item_, most(9), flag("IncludeClassOrigin", true)}),
              HasSubstr("CLASSORIGIN"));
  // These have no such parameters.
  expectError(4, "OpenEnumerateInstances", {item_, flag("LocalOnly", true)});
  expectError(4, "OpenEnumerateInstances", {item_, flag("IncludeQualifiers", true)});
}

TEST_F(Pull, refusesAtTheOpening) {
  expectError(5, "OpenEnumerateInstances", {{"ClassName", className("TEST_None")}});
  expectError(5, "OpenEnumerateInstancePaths", {{"ClassName", className("TEST_None")}});
  expectError(7, "OpenEnumerateInstances", {{"ClassName", className("TEST_Unserved")}});
  expectError(2, "OpenEnumerateInstances", {{"ClassName", className("TEST_Refused")}, most(5)});
  expectError(4, "OpenAssociatorInstances", {{"InstanceName", instanceName("TEST_None", "x")}});
  expectError(4, "OpenAssociatorInstances", {{"InstanceName", className("TEST_Place")}});
  EXPECT_EQ(endpoint_->contexts(), 0U);
}

TEST_F(Pull, refusesWhatItDoesNotHave) {
  expectError(25, "OpenEnumerateInstances",
              {item_, {"FilterQueryLanguage", text("DMTF:FQL")}, {"FilterQuery", text("Number = 1")}});
  expectError(4, "OpenEnumerateInstances", {item_, {"FilterQuery", text("Number = 1")}});
  expectError(26, "OpenEnumerateInstances", {item_, flag("ContinueOnError", true)});
  ask("OpenEnumerateInstances", {item_,
                                 most(9),
                                 flag("ContinueOnError", false),
                                 {"FilterQuery", ""},
                                 {"FilterQueryLanguage", text("")}});
  const Given language{"FilterQueryLanguage", text("WQL")};
  const Given query{"FilterQuery", text("SELECT * FROM TEST_Item")};
  expectError(7, "OpenQueryInstances", {language, query, flag("ReturnQueryResultClass", true)});
  expectError(26, "OpenQueryInstances", {language, query, flag("ContinueOnError", true)});
  expectError(4, "OpenQueryInstances", {language});
  expectError(14, "OpenQueryInstances",
              {{"FilterQueryLanguage", text("SQL")}, {"FilterQuery", text("hello")}});
}

TEST_F(Pull, boundsTheTimeout) {
  settings_.longestIdleTime = std::chrono::seconds(90);
  restart();
  const auto asking = [this](const std::string& seconds) {
    return std::vector<Given>{crowd_, {"OperationTimeout", text(seconds)}};
  };
  expectError(22, "OpenEnumerateInstances", asking("0"));
  EXPECT_THAT(expectError(22, "OpenEnumerateInstances", asking("91")), HasSubstr("90"));
  const std::string body = ask("OpenEnumerateInstances", asking("90"));
  const std::string id = outParameter(body, "EnumerationContext");
  passed_ = std::chrono::seconds(89);
  pull(id, 1);
  passed_ = std::chrono::seconds(89 + 90);
  expectGone(id);
}

TEST_F(Pull, expires) {
  settings_.idleTime = std::chrono::seconds(60);
  restart();
  control_.set(&Control::allowed, 2);
  const std::string id = open(1);
  passed_ = std::chrono::seconds(60);
  EXPECT_THAT(expectError(21, "PullInstancesWithPath", {context(id), most(1)}), HasSubstr("not used"));
  EXPECT_EQ(endpoint_->contexts(), 0U);
  // The provider is not held up any more.
  control_.set(&Control::allowed, Control::all);
  EXPECT_TRUE(waitFor(&Control::running, 0));
}

// Nobody asks for anything any more, and yet the provider is let go.
TEST_F(Pull, expiresWithoutAnotherRequest) {
  settings_.waitingObjects = 1;
  restart();
  control_.set(&Control::size, 100);
  open(1);
  passed_ = settings_.idleTime;
  EXPECT_TRUE(waitFor(&Control::running, 0));
  EXPECT_EQ(endpoint_->contexts(), 0U);
}

TEST_F(Pull, holdsOnlyAsManyObjectsAsAllowed) {
  settings_.waitingObjects = 4;
  settings_.objectsPerPull = 5;
  restart();
  control_.set(&Control::size, 100);
  const std::string id = open();
  // Four wait, and the provider is about to hand over the fifth.
  ASSERT_TRUE(waitFor(&Control::delivered, 4));
  EXPECT_THAT(names(pull(id, 100)), SizeIs(5));
  ASSERT_TRUE(waitFor(&Control::delivered, 9));
  EXPECT_EQ(control_.get(&Control::running), 1U);
}

TEST_F(Pull, closes) {
  settings_.waitingObjects = 1;
  restart();
  control_.set(&Control::size, 100);
  const std::string id = open(1);
  EXPECT_THAT(ask("CloseEnumeration", {context(id)}), Not(HasSubstr("IRETURNVALUE")));
  EXPECT_EQ(endpoint_->contexts(), 0U);
  EXPECT_TRUE(waitFor(&Control::running, 0));
  expectGone(id);
}

TEST_F(Pull, countsWhatIsLeftOnceItIsKnown) {
  control_.set(&Control::size, 5);
  control_.set(&Control::allowed, 3);
  const std::string id = open(1);
  EXPECT_THAT(ask("EnumerationCount", {context(id)}), HasSubstr("<IRETURNVALUE></IRETURNVALUE>"));
  control_.set(&Control::allowed, Control::all);
  ASSERT_TRUE(waitFor(&Control::running, 0));
  // The provider has returned; what it delivered is known when the last object can be seen.
  EXPECT_THAT(names(pull(id, 2)), SizeIs(2));
  std::string body;
  for (int tries = 0; tries < 2000 && body.find("<VALUE>") == std::string::npos; ++tries)
    body = ask("EnumerationCount", {context(id)});
  EXPECT_THAT(body, HasSubstr("<IRETURNVALUE><VALUE>2</VALUE></IRETURNVALUE>"));
}

TEST_F(Pull, takesNoContextOfItsOwnMaking) {
  open(1);
  expectGone("");
  expectGone("0");
  expectGone("00000000000000000000000000000000");
}

TEST_F(Pull, makesContextsThatNobodyGuesses) {
  const std::string one = open(1);
  const std::string two = open(1);
  EXPECT_EQ(one.size(), 32U);
  EXPECT_NE(one, two);
  EXPECT_NE(one.substr(0, 8), two.substr(0, 8));
  EXPECT_EQ(one.find_first_not_of("0123456789abcdef"), std::string::npos);
}

TEST_F(Pull, belongsToItsUserAndNamespace) {
  Request opening = request("OpenEnumerateInstances", {crowd_});
  opening.user = "mary";
  const std::string id = outParameter(send(opening).body, "EnumerationContext");
  for (const char* method : {"PullInstancesWithPath", "CloseEnumeration"}) {
    std::vector<Given> parameters = {context(id)};
    if (method[0] == 'P')
      parameters.push_back(most(1));
    expectError(21, method, parameters);  // nobody
    Request other = request(method, parameters);
    other.user = "john";
    EXPECT_EQ(errorCode(send(other).body), 21);
    Request elsewhere = request(method, parameters, "root/other");
    elsewhere.user = "mary";
    EXPECT_EQ(errorCode(send(elsewhere).body), 21);
  }
  Request own = request("PullInstancesWithPath", {context(id), most(1)}, "ROOT/test");
  own.user = "mary";
  EXPECT_THAT(names(send(own).body), ElementsAre("TEST_Crowd n0"));
}

TEST_F(Pull, isDoneWithTheOperationOfItsKind) {
  const std::string instances = open(1);
  expectError(21, "PullInstancePaths", {context(instances), most(1)});
  expectError(21, "PullInstances", {context(instances), most(1)});
  EXPECT_THAT(names(pull(instances, 1)), SizeIs(1));
  const std::string paths = outParameter(ask("OpenEnumerateInstancePaths", {crowd_}), "EnumerationContext");
  expectError(21, "PullInstancesWithPath", {context(paths), most(1)});
  EXPECT_THAT(names(ask("PullInstancePaths", {context(paths), most(2)})),
              ElementsAre("TEST_Crowd n0", "TEST_Crowd n1"));
  const std::string query = outParameter(
      ask("OpenQueryInstances",
          {{"FilterQueryLanguage", text("WQL")}, {"FilterQuery", text("SELECT * FROM TEST_Item")}}),
      "EnumerationContext");
  expectError(21, "PullInstancesWithPath", {context(query), most(1)});
  EXPECT_TRUE(isEnd(ask("PullInstances", {context(query), most(2)})));
}

TEST_F(Pull, boundsTheNumberOfContexts) {
  settings_.contexts = 2;
  restart();
  const std::string first = open(1);
  open(1);
  EXPECT_THAT(expectError(27, "OpenEnumerateInstances", {crowd_}), HasSubstr("2 open enumerations"));
  ask("CloseEnumeration", {context(first)});
  open(1);
}

// A provider that never returns is not let run more often than allowed.
TEST_F(Pull, boundsTheProvidersThatDoNotReturn) {
  settings_.contexts = 2;
  settings_.lookAhead = std::chrono::milliseconds(0);
  restart();
  control_.set(&Control::allowed, 0);
  for (int count = 0; count < 4; ++count) {
    const std::string id = open();
    if (count < 3)
      ask("CloseEnumeration", {context(id)});
  }
  expectError(27, "OpenEnumerateInstances", {crowd_});
  control_.set(&Control::allowed, Control::all);
}

TEST_F(Pull, tellsOfAFailureAfterWhatCameBefore) {
  control_.set(&Control::failsAfter, 2);
  const std::string id = open(1);
  const std::string body = pull(id, 5);
  EXPECT_THAT(names(body), ElementsAre("TEST_Crowd n1"));
  EXPECT_FALSE(isEnd(body));
  EXPECT_EQ(expectError(2, "PullInstancesWithPath", {context(id), most(5)}), "no entry");
  EXPECT_EQ(endpoint_->contexts(), 0U);
  expectGone(id);
}

TEST_F(Pull, isOverWhenTheClientWasGone) {
  settings_.pieceSize = 1;
  restart();
  control_.set(&Control::size, 100);
  const std::string id = open(1);
  Recorded answer;
  answer.takes = 1;
  endpoint_->handle(request("PullInstancesWithPath", {context(id), most(50)}), answer);
  EXPECT_EQ(endpoint_->contexts(), 0U);
  expectGone(id);
}

TEST_F(Pull, endsWithTheServer) {
  const std::string id = open(1);
  endpoint_->shutDown();
  EXPECT_EQ(endpoint_->contexts(), 0U);
  expectError(28, "OpenEnumerateInstances", {crowd_});
  expectGone(id);
  // What needs no context is still answered.
  EXPECT_THAT(names(ask("EnumerateInstances", {item_})), SizeIs(3));
}

}  // namespace
