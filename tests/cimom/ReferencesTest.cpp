#include "Linked.h"

#include <cimom/broker/WbemUri.h>

namespace {

using association_test::Answer;
using association_test::Linked;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;
using testing::UnorderedElementsAre;

class References : public Linked {
 protected:
  Answer names(std::string_view className) {
    return paths([&](const cimom::PathSink& sink) {
      return manager_.enumerateInstanceNames("root/test", className, sink);
    });
  }
  Answer get(const std::string& path) {
    return instances(
        [&](const cimom::InstanceSink& sink) { return manager_.getInstance(path, std::nullopt, sink); });
  }
};

TEST_F(References, areTheAssociationsOfTheSource) {
  EXPECT_THAT(links(firmwarePath, {.associationClass = "TEST_Runs"}),
              ElementsAre("TEST_Runs(TEST_Controller c,TEST_Firmware f1)"));
  EXPECT_THAT(links(firmwarePath, {.associationClass = "TEST_Installed"}),
              ElementsAre("TEST_Installed(TEST_System s,TEST_Firmware f1)",
                          "TEST_Installed(TEST_Controller c,TEST_Firmware f1)"));
  EXPECT_THAT(links(portPath, {.associationClass = "TEST_Runs"}), IsEmpty());
  EXPECT_THAT(complaints(), IsEmpty());
}

TEST_F(References, areThoseThatHoldTheSourceInTheRole) {
  EXPECT_THAT(links(firmwarePath, {.associationClass = "TEST_Peer", .role = "antecedent"}),
              ElementsAre("TEST_Peer(TEST_Firmware f1,TEST_Firmware f2)"));
  EXPECT_THAT(links(firmwarePath, {.associationClass = "TEST_Peer", .role = "Dependent"}),
              ElementsAre("TEST_Peer(TEST_Firmware f3,TEST_Firmware f1)"));
  EXPECT_THAT(links(controllerPath, {.associationClass = "TEST_Runs", .role = "Antecedent"}),
              ElementsAre("TEST_Runs(TEST_Controller c,TEST_Firmware f1)"));
  EXPECT_THAT(calls(), testing::Contains("references of=TEST_Peer role=antecedent"));
}

TEST_F(References, ofClassesWithoutTheRoleAreNotAskedFor) {
  EXPECT_THAT(links(firmwarePath, {.associationClass = "TEST_Peer", .role = "System"}), IsEmpty());
  EXPECT_THAT(calls(), IsEmpty());
}

// The provider of TEST_Holds also returns what that of TEST_HoldsMore is asked for.
TEST_F(References, comeOnceFromAClassAndThoseBelowIt) {
  EXPECT_THAT(
      links(serverPath, {.associationClass = "TEST_Holds"}),
      ElementsAre("TEST_Holds(TEST_System s,TEST_Firmware f2)", "TEST_Holds(TEST_System s,TEST_Firmware f2)",
                  "TEST_HoldsKind(TEST_System s,TEST_Port kind)",
                  "TEST_HoldsMore(TEST_System s,TEST_Port more)"));
}

TEST_F(References, takeNoNoticeOfTheFarEnd) {
  EXPECT_EQ(links(firmwarePath, {"TEST_Runs", "TEST_Port", "", "Dependent"}).size(), 1U);
}

TEST_F(References, haveThePropertiesAskedFor) {
  std::size_t count = 0;
  manager_.references(firmwarePath, {.associationClass = "TEST_Runs"}, {{"Antecedent"}},
                      [&count](const cimom::Instance& instance) {
                        count += instance.properties().size();
                        EXPECT_EQ(instance.find("Note"), nullptr);
                        return true;
                      });
  EXPECT_EQ(count, 2U);
}

TEST_F(References, handOnTheStatusOfTheProvider) {
  for (const Answer& answer : {references(firmwarePath, {.associationClass = "TEST_ElementSoftware"}),
                               referenceNames(firmwarePath, {.associationClass = "TEST_ElementSoftware"})}) {
    EXPECT_EQ(answer.outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(answer.outcome.status.description, "no references here");
    EXPECT_THAT(answer.objects, ElementsAre("TEST_Runs(TEST_Controller c,TEST_Firmware f1)"));
  }
}

TEST_F(References, areEnumeratedOnceFromAnAncestor) {
  EXPECT_THAT(
      names("TEST_Dependency").objects,
      UnorderedElementsAre(
          "TEST_Runs(TEST_Controller c,TEST_Firmware f1)", "TEST_Serves(TEST_Firmware f1,TEST_Port p)",
          "TEST_Holds(TEST_System s,TEST_Firmware f2)", "TEST_Holds(TEST_System s,TEST_Firmware f2)",
          "TEST_HoldsKind(TEST_System s,TEST_Port kind)", "TEST_Peer(TEST_Firmware f1,TEST_Firmware f2)",
          "TEST_Peer(TEST_Firmware f3,TEST_Firmware f1)", "TEST_HoldsMore(TEST_System s,TEST_Port more)"));
  EXPECT_THAT(names("TEST_ElementSoftware").objects,
              UnorderedElementsAre("TEST_Runs(TEST_Controller c,TEST_Firmware f1)",
                                   "TEST_Serves(TEST_Firmware f1,TEST_Port p)"));
}

// What a name prints can be typed back, references with quotes in quotes included, and names the instance.
TEST_F(References, canBeFetchedByTheirPrintedPaths) {
  std::vector<std::string> printed;
  for (const char* className : {"TEST_Installed", "TEST_Runs"})
    manager_.enumerateInstanceNames("root/test", className, [&printed](const cimom::ObjectPath& path) {
      printed.push_back(cimom::formatWbemUri(path));
      return true;
    });
  ASSERT_EQ(printed.size(), 5U);
  EXPECT_EQ(
      printed[2],
      "root/test:TEST_Installed.System=\"root/test:TEST_System.Name=\\\"s\\\"\","
      "Installed=\"root/test:TEST_Software.Name=\\\"d \\\\\\\"quoted\\\\\\\" \\\\\\\\ and, more=\\\"\"");
  for (const std::string& path : printed) {
    const Answer answer = get(path);
    EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK) << path << ": " << answer.outcome.status.description;
    EXPECT_EQ(answer.outcome.delivered, 1U);
  }
}

TEST_F(References, typedWithoutNamespacesMeanTheirAssociations) {
  const Answer answer =
      get(R"(test_runs.dependent="TEST_Firmware.Name=\"f1\"",antecedent="TEST_Controller.NAME=\"c\"")");
  EXPECT_EQ(answer.outcome.status.code, CMPI_RC_OK) << answer.outcome.status.description;
  EXPECT_THAT(answer.objects, ElementsAre("TEST_Runs(TEST_Controller c,TEST_Firmware f1)"));
  EXPECT_THAT(calls(), ElementsAre("get of=TEST_Runs in root/test"));
}

TEST_F(References, keysMustBeReferences) {
  const Answer text = get(R"(TEST_Runs.Antecedent="c",Dependent="TEST_Firmware.Name=\"f1\"")");
  EXPECT_EQ(text.outcome.status.code, CMPI_RC_ERR_NOT_FOUND);
  const Answer missing = get(R"(TEST_Runs.Antecedent="TEST_Controller.Name=\"c\"")");
  EXPECT_EQ(missing.outcome.status.code, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_THAT(missing.outcome.status.description, HasSubstr("key Dependent"));
}

// The source is an association itself, so that the remark's path holds references in references.
TEST_F(References, mayReferToAssociations) {
  const std::string link =
      R"(TEST_Installed.System="TEST_System.Name=\"s\"",Installed="TEST_Firmware.Name=\"f1\"")";
  const std::string other =
      R"(TEST_Installed.System="TEST_System.Name=\"s\"",Installed="TEST_Firmware.Name=\"f2\"")";
  const std::string expected = "TEST_Remark(TEST_Installed(TEST_System s,TEST_Firmware f1),TEST_Port p)";
  EXPECT_THAT(links(link, {.associationClass = "TEST_Remark", .role = "Link"}), ElementsAre(expected));
  EXPECT_THAT(links(other, {.associationClass = "TEST_Remark", .role = "Link"}), IsEmpty());
  manager_.referenceNames(link, {.associationClass = "TEST_Remark"}, [&](const cimom::ObjectPath& path) {
    const std::string printed = cimom::formatWbemUri(path);
    cimom::Arena arena;
    const cimom::ObjectPath& back = *cimom::parseWbemUri(arena, manager_.classTable(), printed);
    EXPECT_TRUE(cimom::samePath(back, path)) << printed;
    EXPECT_EQ(cimom::pathHash(back), cimom::pathHash(path));
    EXPECT_EQ(cimom::formatWbemUri(back), printed);
    return true;
  });
}

// A path does not hold the author, who is no key: the provider, which was given the role, is trusted.
TEST_F(References, thatTheAnswerLacksAreLeftToTheProvider) {
  const Query query{.associationClass = "TEST_Remark", .role = "Author"};
  EXPECT_EQ(references(serverPath, query).objects.size(), 1U);
  EXPECT_EQ(references(controllerPath, query).objects.size(), 0U);
  EXPECT_EQ(referenceNames(serverPath, query).objects.size(), 1U);
  EXPECT_THAT(calls(), testing::Contains("referenceNames of=TEST_Remark role=Author"));
}

}  // namespace
