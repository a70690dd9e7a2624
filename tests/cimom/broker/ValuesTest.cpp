// Strings, arrays, contexts and arguments through their tables.
#include "Fixture.h"

#include <cimom/broker/Context.h>

namespace cimom {
namespace {

class ValuesTest : public BrokerTest {};

TEST_F(ValuesTest, AStringHasItsText) {
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  const CMPIString* const string = eft_->newString(mb_, "größe", &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_STREQ(string->ft->getCharPtr(string, &status), "größe");
  EXPECT_STREQ(newString("")->ft->getCharPtr(newString(""), nullptr), "");
  EXPECT_EQ(eft_->newString(mb_, nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(ValuesTest, AnArrayBeginsWithNulls) {
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  const CMPIArray* const array = eft_->newArray(mb_, 3, CMPI_uint32, &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(array->ft->getSize(array, &status), 3U);
  EXPECT_EQ(array->ft->getSimpleType(array, &status), CMPI_uint32);
  for (CMPICount index = 0; index < 3; ++index) {
    const CMPIData data = array->ft->getElementAt(array, index, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_EQ(data.type, CMPI_uint32);
    EXPECT_EQ(data.state, CMPI_nullValue);
  }
  (void)array->ft->getElementAt(array, 3, &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
}

TEST_F(ValuesTest, AnArrayMayBeEmpty) {
  const CMPIArray* const array = eft_->newArray(mb_, 0, CMPI_string, nullptr);
  ASSERT_NE(array, nullptr);
  EXPECT_EQ(array->ft->getSize(array, nullptr), 0U);
}

TEST_F(ValuesTest, ArraysTakeTheirOwnTypeAlone) {
  for (const auto& [name, type] : propertyTypes()) {
    CMPIArray* const array = eft_->newArray(mb_, 1, type, nullptr);
    for (const auto& [other, given] : propertyTypes()) {
      const CMPIValue value = sample(given);
      const CMPIrc expected = given == type ? CMPI_RC_OK : CMPI_RC_ERR_TYPE_MISMATCH;
      EXPECT_EQ(array->ft->setElementAt(array, 0, &value, given).rc, expected) << name << " " << other;
    }
    EXPECT_TRUE(sameValue(array->ft->getElementAt(array, 0, nullptr), dataOf(type, sample(type)))) << name;
    const CMPIValue value = sample(type);
    EXPECT_EQ(array->ft->setElementAt(array, 1, &value, type).rc, CMPI_RC_ERR_NO_SUCH_PROPERTY);
    EXPECT_EQ(array->ft->setElementAt(array, 0, nullptr, type).rc, CMPI_RC_OK);
    EXPECT_EQ(array->ft->getElementAt(array, 0, nullptr).state, CMPI_nullValue);
    EXPECT_EQ(array->ft->getElementAt(array, 0, nullptr).type, type);
  }
}

TEST_F(ValuesTest, AnArrayOfTextsIsAnArrayOfStrings) {
  CMPIArray* const array = eft_->newArray(mb_, 2, CMPI_chars, nullptr);
  EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_string);
  const CMPIValue* const value = chars("text");
  EXPECT_EQ(array->ft->setElementAt(array, 1, value, CMPI_chars).rc, CMPI_RC_OK);
  EXPECT_EQ(text(array->ft->getElementAt(array, 1, nullptr)), "text");
}

TEST_F(ValuesTest, ImpossibleArraysAreRefused) {
  CMPIStatus status{};
  for (const CMPIType type : {CMPI_null, CMPI_uint8A, CMPI_args, CMPI_enumeration, CMPIType{0x0777}}) {
    EXPECT_EQ(eft_->newArray(mb_, 1, type, &status), nullptr);
    EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
  }
  EXPECT_EQ(eft_->newArray(mb_, ~CMPICount{0}, CMPI_uint8, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_INVALID_PARAMETER);
}

TEST_F(ValuesTest, AContextHasItsEntries) {
  Context* const made = Context::create(request_.held());
  EXPECT_EQ(made->setText(CMPIPrincipal, "somebody"), CMPI_RC_OK);
  EXPECT_EQ(made->setFlags(CMPI_FLAG_DeepInheritance), CMPI_RC_OK);
  const CMPIContext* const context = made;
  const CMPIContextFT& ft = *context->ft;
  EXPECT_EQ(text(ft.getEntry(context, "cmpiPRINCIPAL", nullptr)), "somebody");
  EXPECT_EQ(ft.getEntry(context, CMPIInvocationFlags, nullptr).value.uint32, CMPI_FLAG_DeepInheritance);
  const CMPIValue* const role = chars("role");
  EXPECT_EQ(ft.addEntry(context, CMPIRole, role, CMPI_chars).rc, CMPI_RC_OK);
  EXPECT_EQ(ft.addEntry(context, "cmpirole", role, CMPI_chars).rc, CMPI_RC_OK);
  EXPECT_EQ(ft.getEntryCount(context, nullptr), 3U);
  CMPIString* name = nullptr;
  EXPECT_EQ(text(ft.getEntryAt(context, 2, &name, nullptr)), "role");
  EXPECT_EQ(textOf(name), CMPIRole);
  CMPIStatus status{};
  (void)ft.getEntry(context, "Missing", &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
  (void)ft.getEntryAt(context, 3, &name, &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
  EXPECT_EQ(ft.addEntry(context, "", role, CMPI_chars).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(ft.addEntry(context, "x", role, CMPI_ptr).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
}

TEST_F(ValuesTest, ArgumentsHaveValuesOfEveryType) {
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  const CMPIArgs* const args = eft_->newArgs(mb_, &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  for (const auto& [name, type] : propertyTypes()) {
    const auto arrayType = static_cast<CMPIType>(type | CMPI_ARRAY);
    const CMPIValue value = sample(type);
    const CMPIValue array = sample(arrayType);
    EXPECT_EQ(args->ft->addArg(args, name.c_str(), &value, type).rc, CMPI_RC_OK);
    EXPECT_EQ(args->ft->addArg(args, (name + "s").c_str(), &array, arrayType).rc, CMPI_RC_OK);
    EXPECT_TRUE(sameValue(args->ft->getArg(args, name.c_str(), nullptr), dataOf(type, value)));
  }
  EXPECT_EQ(args->ft->getArgCount(args, nullptr), propertyTypes().size() * 2);
  CMPIString* name = nullptr;
  EXPECT_EQ(args->ft->getArgAt(args, 1, &name, nullptr).type, CMPI_booleanA);
  EXPECT_EQ(textOf(name), "Booleans");
}

TEST_F(ValuesTest, ComparisonLooksAtTypeAndValue) {
  for (const auto& [name, type] : propertyTypes()) {
    for (const auto& [other, otherType] : propertyTypes()) {
      EXPECT_EQ(sameValue(dataOf(type, sample(type)), dataOf(otherType, sample(otherType))),
                type == otherType)
          << name << " " << other;
    }
  }
  CMPIData null{};
  null.state = CMPI_nullValue;
  EXPECT_TRUE(sameValue(null, null));
  EXPECT_FALSE(sameValue(null, dataOf(CMPI_uint8, number(0))));
}

}  // namespace
}  // namespace cimom
