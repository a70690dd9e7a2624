// Clones belong to nobody until they are released; everything else goes with its request.
#include "Fixture.h"

#include <cimom/broker/Context.h>
#include <cimom/broker/Enumeration.h>

namespace cimom {
namespace {

class CloneTest : public BrokerTest {
 protected:
  /// An instance with a value of every type, embedded and referred ones inside.
  CMPIInstance* fullInstance() {
    CMPIInstance* const instance = eft_->newInstance(mb_, newKeyedPath("id"), nullptr);
    for (const auto& [name, type] : propertyTypes()) {
      const auto arrayType = static_cast<CMPIType>(type | CMPI_ARRAY);
      const CMPIValue value = sample(type);
      const CMPIValue array = sample(arrayType);
      EXPECT_EQ(instance->ft->setProperty(instance, name.c_str(), &value, type).rc, CMPI_RC_OK);
      EXPECT_EQ(instance->ft->setProperty(instance, (name + "s").c_str(), &array, arrayType).rc, CMPI_RC_OK);
    }
    return instance;
  }

  template <class Handle>
  static Handle* clone(const Handle* original) {
    CMPIStatus status{CMPI_RC_ERROR, nullptr};
    Handle* const copy = original->ft->clone(original, &status);
    EXPECT_EQ(status.rc, CMPI_RC_OK);
    EXPECT_NE(copy, original);
    return copy;
  }
  template <class Handle>
  static void release(Handle* handle) {
    EXPECT_EQ(handle->ft->release(handle).rc, CMPI_RC_OK);
  }
};

TEST_F(CloneTest, AnInstanceOutlivesItsRequest) {
  CMPIInstance* const copy = clone(fullInstance());
  CMPIData expected = dataOf(CMPI_instance, CMPIValue{});
  expected.value.inst = copy;
  request_.recycle();
  EXPECT_EQ(Instance::from(copy)->properties().size(), propertyTypes().size() * 2 + 1);
  expected.value.inst = fullInstance();
  CMPIData actual = dataOf(CMPI_instance, CMPIValue{});
  actual.value.inst = copy;
  EXPECT_TRUE(sameValue(actual, expected));
  release(copy);
}

TEST_F(CloneTest, AnInstanceCanBeChangedAfterItsRequest) {
  CMPIInstance* const copy = clone(newThing());
  request_.recycle();
  const CMPIValue value = sample(CMPI_ref);
  EXPECT_EQ(copy->ft->setProperty(copy, "Reference", &value, CMPI_ref).rc, CMPI_RC_OK);
  for (int round = 0; round < 100; ++round) {
    const CMPIValue* const text = chars("another text");
    copy->ft->setProperty(copy, "Caption", text, CMPI_chars);
  }
  request_.recycle();
  EXPECT_EQ(text(copy->ft->getProperty(copy, "Caption", nullptr)), "another text");
  EXPECT_NE(objectPath(copy->ft->getProperty(copy, "Reference", nullptr)), nullptr);
  release(copy);
}

TEST_F(CloneTest, PathsStringsTimesAndArraysOutliveTheirRequest) {
  CMPIObjectPath* const path = clone(newKeyedPath("id"));
  CMPIObjectPath* const unknown = clone(newPath("Unknown_Class"));
  CMPIString* const string = clone(newString("text"));
  CMPIDateTime* const time = clone(sample(CMPI_dateTime).dateTime);
  CMPIArray* const array = clone(sample(CMPI_refA).array);
  request_.recycle();
  EXPECT_EQ(textOf(path->ft->toString(path, nullptr)), "root/test:Test_Thing.InstanceID=\"id\"");
  EXPECT_EQ(textOf(unknown->ft->getClassName(unknown, nullptr)), "Unknown_Class");
  EXPECT_EQ(textOf(string), "text");
  EXPECT_EQ(textOf(time->ft->getStringFormat(time, nullptr)), "20240229123456.123456+060");
  EXPECT_NE(objectPath(array->ft->getElementAt(array, 0, nullptr)), nullptr);
  release(path);
  release(unknown);
  release(string);
  release(time);
  release(array);
}

TEST_F(CloneTest, ContextsArgumentsAndEnumerationsOutliveTheirRequest) {
  Context* const context = Context::create(request_.arena());
  context->setText(CMPIPrincipal, "somebody");
  CMPIContext* const contextCopy = clone<CMPIContext>(context);
  const CMPIArgs* const args = eft_->newArgs(mb_, nullptr);
  const CMPIValue value = sample(CMPI_instance);
  args->ft->addArg(args, "Argument", &value, CMPI_instance);
  CMPIArgs* const argsCopy = clone(args);
  const CMPIData elements[] = {dataOf(CMPI_ref, sample(CMPI_ref))};
  CMPIEnumeration* const enumeration =
      clone<CMPIEnumeration>(Enumeration::create(request_.arena(), CMPI_ref, elements));
  request_.recycle();
  EXPECT_EQ(text(contextCopy->ft->getEntry(contextCopy, CMPIPrincipal, nullptr)), "somebody");
  EXPECT_NE(instance(argsCopy->ft->getArg(argsCopy, "argument", nullptr)), nullptr);
  EXPECT_NE(objectPath(enumeration->ft->getNext(enumeration, nullptr)), nullptr);
  release(contextCopy);
  release(argsCopy);
  release(enumeration);
}

// What a getter gives of a clone belongs to the request, and outlives the clone.
TEST_F(CloneTest, AnswersOfACloneOutliveIt) {
  CMPIObjectPath* const path = clone(newKeyedPath("id"));
  CMPIInstance* const copy = clone(fullInstance());
  const CMPIString* const nameSpace = path->ft->getNameSpace(path, nullptr);
  const CMPIData key = path->ft->getKey(path, "InstanceID", nullptr);
  const CMPIObjectPath* const itsPath = copy->ft->getObjectPath(copy, nullptr);
  const CMPIData array = copy->ft->getProperty(copy, "Strings", nullptr);
  release(path);
  release(copy);
  EXPECT_EQ(textOf(nameSpace), "root/test");
  EXPECT_EQ(text(key), "id");
  EXPECT_EQ(text(itsPath->ft->getKey(itsPath, "InstanceID", nullptr)), "id");
  EXPECT_EQ(text(elements(array)[0]), "text");
}

TEST_F(CloneTest, AskingACloneDoesNotMakeItGrow) {
  CMPIInstance* const copy = clone(fullInstance());
  const std::size_t footprint = Instance::from(copy)->arena()->footprint();
  for (int round = 0; round < 1000; ++round) {
    (void)copy->ft->getObjectPath(copy, nullptr);
    (void)copy->ft->getProperty(copy, "Embedded", nullptr);
  }
  EXPECT_EQ(Instance::from(copy)->arena()->footprint(), footprint);
  release(copy);
}

TEST_F(CloneTest, ReleasingAnObjectOfTheRequestIsHarmless) {
  CMPIInstance* const instance = fullInstance();
  release(instance);
  release(instance);
  EXPECT_EQ(Instance::from(instance)->properties().size(), propertyTypes().size() * 2 + 1);
  CMPIString* const name = instance->ft->getObjectPath(instance, nullptr)
                               ->ft->getClassName(instance->ft->getObjectPath(instance, nullptr), nullptr);
  release(name);  // the class table's own
  EXPECT_EQ(textOf(name), "Test_Thing");
}

TEST_F(CloneTest, TheMemoryTableReleasesClones) {
  const CMPIBrokerMemFT& mft = *mb_->mft;
  mft.freeInstance(mb_, clone(fullInstance()));
  mft.freeObjectPath(mb_, clone(newPath()));
  mft.freeArgs(mb_, clone(eft_->newArgs(mb_, nullptr)));
  mft.freeString(mb_, clone(newString("x")));
  mft.freeArray(mb_, clone(sample(CMPI_stringA).array));
  mft.freeDateTime(mb_, clone(sample(CMPI_dateTime).dateTime));
  CMPIInstance* const instance = fullInstance();
  mft.freeInstance(mb_, instance);
  EXPECT_EQ(textOf(eft_->getType(mb_, instance, nullptr)), "CMPIInstance");
}

// An object that is older than a mark may be given newer values, which must not go with the mark.
TEST_F(CloneTest, ValuesSetAfterAMarkOutliveIt) {
  CMPIInstance* const instance = newThing();
  CMPIGcStat* const mark = mb_->mft->mark(mb_, nullptr);
  const CMPIValue value = sample(CMPI_string);
  instance->ft->setProperty(instance, "String", &value, CMPI_string);
  const CMPIValue reference = sample(CMPI_ref);
  instance->ft->setProperty(instance, "Reference", &reference, CMPI_ref);
  EXPECT_EQ(mb_->mft->release(mb_, mark).rc, CMPI_RC_OK);
  EXPECT_EQ(text(instance->ft->getProperty(instance, "String", nullptr)), "text");
  EXPECT_EQ(objectPath(instance->ft->getProperty(instance, "Reference", nullptr))->keys().size(), 1U);
}

}  // namespace
}  // namespace cimom
