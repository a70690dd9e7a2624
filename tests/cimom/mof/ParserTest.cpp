#include <cimom/mof/MofError.h>
#include <cimom/mof/Parser.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <variant>

namespace {

using cimom::mof::Class;
using cimom::mof::findQualifier;
using cimom::mof::Include;
using cimom::mof::InstanceDeclaration;
using cimom::mof::isTrue;
using cimom::mof::Method;
using cimom::mof::Parser;
using cimom::mof::Property;
using cimom::mof::QualifierDeclaration;
using cimom::mof::textOf;
using cimom::mof::Value;

template <class Expected>
Expected first(std::string_view text) {
  return std::get<Expected>(Parser(text, "text.mof").next());
}

TEST(MofParser, readsAClassWithItsQualifiers) {
  const auto type = first<Class>(R"(
[ Version("1.0"), Abstract, Description ("one "
    "two" /* between */ " three") : Translatable ]
CLASS A : B { };)");
  EXPECT_EQ(type.name, "A");
  EXPECT_EQ(type.superclass, "B");
  EXPECT_EQ(type.line, 4);
  EXPECT_EQ(textOf(type.qualifiers, "version"), "1.0");
  EXPECT_EQ(textOf(type.qualifiers, "Description"), "one two three");
  EXPECT_TRUE(isTrue(type.qualifiers, "ABSTRACT"));
}

TEST(MofParser, readsProperties) {
  const auto type = first<Class>(R"(class A {
[Key] string Name;
uint16 Counts[4] = {1, 0x10};
[Values {"a", "b"}, Key (false)] sint64 Low = -5;
CIM_Other REF Other;
datetime When = NULL;
};)");
  ASSERT_EQ(type.properties.size(), 5U);
  const Property& name = type.properties[0];
  EXPECT_TRUE(name.key);
  EXPECT_EQ(name.type, CMPI_string);
  EXPECT_EQ(name.origin, "A");
  EXPECT_EQ(name.line, 2);
  const Property& counts = type.properties[1];
  EXPECT_EQ(counts.type, CMPI_uint16A);
  EXPECT_EQ(counts.arraySize, 4U);
  EXPECT_EQ(counts.defaultValue, (Value{true, {std::int64_t{1}, std::int64_t{16}}}));
  const Property& low = type.properties[2];
  EXPECT_FALSE(low.key);
  EXPECT_EQ(low.defaultValue, (Value{false, {std::int64_t{-5}}}));
  EXPECT_EQ(findQualifier(low.qualifiers, "values")->value,
            (Value{true, {std::string("a"), std::string("b")}}));
  EXPECT_TRUE(type.properties[3].isReference());
  EXPECT_EQ(type.properties[3].referenceClass, "CIM_Other");
  EXPECT_TRUE(type.properties[4].defaultValue->isNull());
}

TEST(MofParser, readsMethods) {
  const auto type = first<Class>(R"(class A {
  uint32 Stop();
  [Description("starts")] uint32 Start([In] uint16 How, [In(false), Out] CIM_Job REF Job, string Names[]);
};)");
  ASSERT_EQ(type.methods.size(), 2U);
  EXPECT_TRUE(type.methods[0].parameters.empty());
  const Method& start = type.methods[1];
  EXPECT_EQ(start.type, CMPI_uint32);
  ASSERT_EQ(start.parameters.size(), 3U);
  EXPECT_EQ(start.parameters[1].referenceClass, "CIM_Job");
  EXPECT_TRUE(isTrue(start.parameters[1].qualifiers, "Out"));
  EXPECT_EQ(start.parameters[2].type, CMPI_stringA);
}

TEST(MofParser, readsQualifierDeclarations) {
  const auto key = first<QualifierDeclaration>(
      "Qualifier Key : boolean = false, Scope(property, reference), Flavor(DisableOverride, ToSubclass);");
  EXPECT_EQ(key.name, "Key");
  EXPECT_EQ(key.type, CMPI_boolean);
  EXPECT_EQ(key.scopes.size(), 2U);
  EXPECT_TRUE(key.toSubclass());
  EXPECT_FALSE(
      first<QualifierDeclaration>("qualifier V : string[], scope(any), flavor(restricted);").toSubclass());
}

TEST(MofParser, readsInstances) {
  const auto instance = first<InstanceDeclaration>(R"(
instance of A as $First { Name = "x"; Other = $Second; Numbers = {1, 2}; };)");
  EXPECT_EQ(instance.className, "A");
  EXPECT_EQ(instance.alias, "$First");
  ASSERT_EQ(instance.values.size(), 3U);
  EXPECT_EQ(instance.values[1].second, (Value{false, {std::string("$Second")}}));
}

TEST(MofParser, readsTheNamespaceOfInstances) {
  Parser parser(R"(instance of A {};
#pragma namespace ("root/interop")
instance of B {};
class C {};
instance of D {};
#pragma locale ("en_US")
#pragma namespace ("//root/cimv2")
instance of E {};)",
                "text.mof");
  EXPECT_EQ(std::get<InstanceDeclaration>(parser.next()).nameSpace, "");
  EXPECT_EQ(std::get<InstanceDeclaration>(parser.next()).nameSpace, "root/interop");
  EXPECT_EQ(std::get<Class>(parser.next()).name, "C");
  EXPECT_EQ(std::get<InstanceDeclaration>(parser.next()).nameSpace, "root/interop");
  EXPECT_EQ(std::get<InstanceDeclaration>(parser.next()).nameSpace, "root/cimv2");
}

TEST(MofParser, refusesNamespacesOfOtherHosts) {
  for (const char* name : {"", "/", "http://other/root/cimv2"}) {
    const std::string text = "\n#pragma namespace (\"" + std::string(name) + "\")\ninstance of A {};";
    Parser parser(text, "text.mof");
    EXPECT_THAT([&] { static_cast<void>(parser.next()); },
                testing::ThrowsMessage<cimom::MofError>(
                    testing::HasSubstr("text.mof:2: #pragma namespace names one of this host")));
  }
}

TEST(MofParser, handsOverIncludesAndSkipsOtherDirectives) {
  Parser parser("#pragma locale (\"en_US\")\n#pragma include (\"a/b.mof\")\nclass C {};", "text.mof");
  const auto include = std::get<Include>(parser.next());
  EXPECT_EQ(include.file, "a/b.mof");
  EXPECT_EQ(include.line, 2);
  EXPECT_EQ(std::get<Class>(parser.next()).name, "C");
  EXPECT_TRUE(std::holds_alternative<cimom::mof::End>(parser.next()));
  EXPECT_TRUE(std::holds_alternative<cimom::mof::End>(parser.next()));
}

}  // namespace
