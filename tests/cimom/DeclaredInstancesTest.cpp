#include "Declared.h"

#include <cimom/DeclaredInstances.h>
#include <cimom/broker/Broker.h>
#include <cimom/broker/Describe.h>

#include <span>
#include <stdexcept>

namespace {

using cimom::MofError;
using cimom::NamedValue;
using declared_test::Answer;
using declared_test::conforms;
using declared_test::Declared;
using declared_test::follows;
using declared_test::plain;
using declared_test::profile;
using testing::ElementsAre;
using testing::HasSubstr;
using testing::IsEmpty;

TEST_F(Declared, areEnumeratedInTheirNamespace) {
  const std::vector<std::string> all = {profile("first"), profile("second", "TEST_SubProfile")};
  const Answer objects = instances("root/about", "TEST_Profile");
  EXPECT_EQ(objects.objects, all);
  EXPECT_EQ(objects.outcome.status.code, CMPI_RC_OK);
  EXPECT_TRUE(objects.outcome.done);
  EXPECT_EQ(objects.outcome.delivered, 2U);
  EXPECT_EQ(names("/ROOT/about", "test_profile").objects, all);
  EXPECT_THAT(names("root/test", "TEST_Profile").objects,
              ElementsAre("root/test:TEST_Profile.Name=\"here\""));
  EXPECT_THAT(names("root/about", "TEST_SubProfile").objects,
              ElementsAre(profile("second", "TEST_SubProfile")));
  EXPECT_EQ(names("root/about", "TEST_Plain3").outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(Declared, haveWhatIsDeclaredAndTheDefaultsOfTheirClass) {
  std::vector<std::string> captions;
  const auto sink = [&](const cimom::Instance& instance) {
    captions.emplace_back(cimom::text(instance.find("Caption")->data).value_or("none"));
    return true;
  };
  manager_.enumerateInstances("root/about", "TEST_Profile", std::nullopt, sink);
  EXPECT_THAT(captions, ElementsAre("by default", "two"));
}

TEST_F(Declared, haveTheirPropertiesNarrowed) {
  std::vector<std::size_t> counts;
  const auto sink = [&](const cimom::Instance& instance) {
    counts.push_back(instance.properties().size());
    return true;
  };
  manager_.enumerateInstances("root/about", "TEST_Profile", std::vector<std::string>{"Caption"}, sink);
  manager_.getInstance(profile("first"), std::vector<std::string>{}, sink);
  manager_.getInstance(profile("first"), std::nullopt, sink);
  EXPECT_THAT(counts, ElementsAre(2U, 2U, 1U, 3U));
}

TEST_F(Declared, areFoundByTheirKeys) {
  EXPECT_THAT(get(profile("first")).objects, ElementsAre(profile("first")));
  EXPECT_THAT(get("TEST_SubProfile.Name=\"second\"").objects,
              ElementsAre(profile("second", "TEST_SubProfile")));
  const Answer none = get(profile("third"));
  EXPECT_EQ(none.outcome.status.code, CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(none.outcome.status.description, "no such instance is declared");
  EXPECT_EQ(get(profile("second")).outcome.status.code, CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(get("root/about:TEST_Profile.Nome=\"first\"").outcome.status.code, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(get("root/none:TEST_Profile.Name=\"first\"").outcome.status.code, CMPI_RC_ERR_INVALID_NAMESPACE);
}

TEST_F(Declared, takeAnyTypeOfProperty) {
  std::string seen;
  manager_.enumerateInstances("root/about", "TEST_Every", std::nullopt, [&](const cimom::Instance& instance) {
    for (const NamedValue& property : instance.properties())
      seen += std::string(property.name) + "=" + cimom::describe(property.data) + " ";
    return true;
  });
  EXPECT_EQ(seen,
            "Id=18446744073709551615 Truth=true U8=255 S8=-128 U16=65535 S16=-32768 U32=4294967295 "
            "S32=-2147483648 S64=-9223372036854775808 R32=0.5 R64=-2.25 C16=120 Text=\"t \\\"q\\\"\" "
            "Time=\"20261121205213.000000+000\" Texts={\"a\", NULL, \"b\"} Truths={true, false} "
            "End=\"root/about:TEST_Profile.Name=\\\"first\\\"\" ");
}

// A pattern stands for an association with each instance that its class has at the time.
TEST_F(Declared, patternsStandForAnAssociationWithEachInstance) {
  const std::vector<std::string> all = {conforms(profile("first"), plain("object 0")),
                                        conforms(profile("first"), plain("object 1")),
                                        conforms(profile("first"), plain("object 2")),
                                        conforms(profile("second", "TEST_SubProfile"), profile("first"))};
  EXPECT_EQ(names("root/about", "TEST_Conforms").objects, all);
  EXPECT_EQ(instances("root/about", "TEST_Conforms").objects, all);
  for (const std::string& each : all)
    EXPECT_THAT(get(each).objects, ElementsAre(each)) << each;
}

TEST_F(Declared, patternsHoldWhatTheProviderKnows) {
  const auto status = [&](const std::string& path) { return get(path).outcome.status.code; };
  EXPECT_EQ(status(conforms(profile("first"), plain("none"))), CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(status(conforms(profile("third"), plain("object 0"))), CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(status(conforms(profile("first"), "root/about:TEST_Plain3.Name=\"object 0\"")),
            CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(status(conforms(profile("first"), profile("first"))), CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(Declared, associationsAreWalkedFromTheirOwnNamespace) {
  EXPECT_THAT(ends(profile("first"), {"TEST_Conforms"}),
              ElementsAre(plain("object 0"), plain("object 1"), plain("object 2"),
                          profile("second", "TEST_SubProfile")));
  EXPECT_THAT(ends(profile("second", "TEST_SubProfile"), {"TEST_Conforms"}), ElementsAre(profile("first")));
  EXPECT_THAT(ends(profile("first"), {"TEST_Follows"}), ElementsAre(profile("second", "TEST_SubProfile")));
  EXPECT_THAT(links(profile("first"), {"TEST_Follows"}),
              ElementsAre(follows(profile("second", "TEST_SubProfile"), profile("first"))));
}

TEST_F(Declared, associationsAreNarrowedByClassAndRoles) {
  const std::string second = profile("second", "TEST_SubProfile");
  const std::vector<std::string> objects = {plain("object 0"), plain("object 1"), plain("object 2")};
  EXPECT_EQ(ends(profile("first"), {.associationClass = "TEST_Conforms", .resultClass = "TEST_Plain3"}),
            objects);
  EXPECT_EQ(ends(profile("first"), {.associationClass = "TEST_Conforms", .role = "standard"}), objects);
  EXPECT_EQ(ends(profile("first"), {.associationClass = "TEST_Conforms", .resultRole = "Element"}), objects);
  EXPECT_THAT(ends(profile("first"), {.associationClass = "TEST_Conforms", .role = "ELEMENT"}),
              ElementsAre(second));
  EXPECT_THAT(ends(profile("first"), {.associationClass = "TEST_Conforms", .resultRole = "Standard"}),
              ElementsAre(second));
  EXPECT_THAT(ends(profile("first"), {.role = "Last", .resultRole = "Next"}), ElementsAre(second));
  EXPECT_THAT(ends(profile("first"), {.role = "Next"}), IsEmpty());
  EXPECT_THAT(ends(profile("first"), {.role = "None"}), IsEmpty());
  EXPECT_THAT(links(profile("first"), {.associationClass = "TEST_Conforms", .role = "Element"}),
              ElementsAre(conforms(second, profile("first"))));
  EXPECT_THAT(links(second, {.role = "Next"}), ElementsAre(follows(second, profile("first"))));
}

TEST_F(Declared, associationsAreWalkedFromTheNamespaceOfTheirEnds) {
  EXPECT_THAT(ends(plain("object 1")), ElementsAre(profile("first")));
  EXPECT_THAT(ends("TEST_Plain3.Name=\"object 1\"", {"TEST_Conforms", "TEST_Profile", "Element", "Standard"}),
              ElementsAre(profile("first")));
  EXPECT_THAT(links(plain("object 1")), ElementsAre(conforms(profile("first"), plain("object 1"))));
  EXPECT_THAT(ends(plain("none")), IsEmpty());
  EXPECT_THAT(links(plain("none")), IsEmpty());
  // The associations themselves are where they were declared.
  EXPECT_EQ(names("root/test", "TEST_Conforms").outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
}

// An end that is not there is no associator, and no reason to fail.
TEST_F(Declared, associationsMayEndOnNothing) {
  const Answer objects = instances("root/about", "TEST_Follows");
  EXPECT_EQ(objects.objects.size(), 2U);
  EXPECT_THAT(
      ends(profile("second", "TEST_SubProfile"), {.associationClass = "TEST_Follows", .role = "Last"}),
      IsEmpty());
}

// What is declared comes, whatever a provider behind a pattern says; its failure is the outcome.
TEST_F(Declared, patternsFailWithTheirProvider) {
  const auto sink = [](const cimom::ObjectPath&) { return true; };
  const std::string reason = "provider Idle has no function for this request";
  for (const cimom::Outcome& outcome :
       {manager_.enumerateInstanceNames("root/about", "TEST_Depends", sink),
        manager_.referenceNames(profile("first"), {.associationClass = "TEST_Depends"}, sink),
        manager_.associatorNames(profile("first"), {.associationClass = "TEST_Depends"}, sink)}) {
    EXPECT_EQ(outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(outcome.status.description, reason);
    EXPECT_EQ(outcome.delivered, 0U);
  }
  const cimom::Outcome all = manager_.associatorNames(profile("first"), {}, sink);
  EXPECT_EQ(all.status.description, reason);
  EXPECT_EQ(all.delivered, 4U);
  EXPECT_THAT(ends("root/test:TEST_Broken.Name=\"x\""), IsEmpty());
}

TEST_F(Declared, sinksMayHaveEnough) {
  std::size_t count = 0;
  const auto first = [&count](const cimom::ObjectPath&) { return ++count < 2; };
  const cimom::Outcome outcome = manager_.enumerateInstanceNames("root/about", "TEST_Conforms", first);
  EXPECT_EQ(outcome.status.code, CMPI_RC_OK);
  EXPECT_EQ(count, 2U);
  const auto refuse = [](const cimom::ObjectPath&) -> bool { throw std::runtime_error("enough"); };
  EXPECT_THROW(manager_.enumerateInstanceNames("root/about", "TEST_Conforms", refuse), std::runtime_error);
  EXPECT_THROW(manager_.associatorNames(profile("first"), {}, refuse), std::runtime_error);
}

TEST_F(Declared, doNotChange) {
  cimom::Arena arena;
  const cimom::ObjectPath& path = *cimom::parseWbemUri(arena, manager_.classTable(), profile("first"));
  const cimom::Instance& instance = *cimom::Instance::create(arena, path);
  const std::string reason = "instances of class TEST_Profile are declared in the schema";
  for (const cimom::Outcome& outcome :
       {manager_.createInstance("root/about", instance, [](const auto&) { return true; }),
        manager_.modifyInstance(instance, std::nullopt), manager_.deleteInstance(path)}) {
    EXPECT_EQ(outcome.status.code, CMPI_RC_ERR_NOT_SUPPORTED);
    EXPECT_EQ(outcome.status.description, reason);
  }
}

/// What making the instances of a text says.
std::string complaint(const std::string& text) {
  cimom::ClassRepository schema;
  schema.compileFile(INTEROP_SCHEMA);
  schema.compileFile(DECLARED_SCHEMA);
  try {
    const std::size_t before = schema.instances().size();
    schema.compileText(text, "d.mof");
    const cimom::Broker broker(schema, {});
    const cimom::DeclaredInstances declared(schema, broker.classes(),
                                            std::span(schema.instances()).subspan(before));
  } catch (const MofError& error) {
    return error.what();
  }
  return {};
}

TEST(DeclaredInstances, sayWhatIsWrongAndWhere) {
  const std::string start = "#pragma namespace (\"n\")\n";
  EXPECT_EQ(complaint(start + "instance of TEST_Profile { Name = \"x\"; };"), "");
  EXPECT_THAT(
      complaint(start + "instance of TEST_Profile { };"),
      HasSubstr("d.mof:2: an instance cannot be declared so: key Name of class TEST_Profile is missing"));
  EXPECT_THAT(
      complaint(start + "instance of TEST_Conforms { Standard = $None; Element = \"TEST_Plain3\"; };"),
      HasSubstr("d.mof:2: property Standard of an instance of TEST_Conforms is $None, which no instance "
                "before this one is declared as"));
  EXPECT_THAT(complaint(start + "instance of TEST_Conforms { Standard = \"a:TEST_None\"; };"),
              HasSubstr("refers to an unknown class TEST_None"));
  EXPECT_THAT(complaint(start + "instance of TEST_Conforms { Standard = \"=\"; };"),
              HasSubstr("is no object path"));
  EXPECT_THAT(
      complaint(start +
                "instance of TEST_Conforms { Standard = \"TEST_Profile\"; Element = \"TEST_Plain3\"; };"),
      HasSubstr("only one reference of an association may be a class; Element is the second"));
  EXPECT_THAT(complaint(start + "instance of TEST_Every { Id = 1; Time = \"today\"; };"),
              HasSubstr("is no datetime: 'today'"));
  EXPECT_THAT(complaint(start + "instance of TEST_Profile { Name = \"x\"; };\n"
                                "instance of TEST_Profile { NAME = \"x\"; };"),
              HasSubstr("d.mof:3: the instance is declared already: n:TEST_Profile.Name=\"x\""));
}

}  // namespace
