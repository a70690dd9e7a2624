// Results and enumerations.
#include "Fixture.h"

#include <cimom/broker/Enumeration.h>
#include <cimom/broker/Result.h>

namespace cimom {
namespace {

/// Writes down what comes, and stops after `limit` objects.
class Recorder : public ResultSink {
 public:
  bool instance(Instance& instance) override { return add(formatted("instance ", instance.path())); }
  bool path(ObjectPath& path) override { return add(formatted("path ", path)); }
  bool data(const CMPIData& value) override { return add("data " + std::string(text(value).value_or("-"))); }
  void done() override { seen.emplace_back("done"); }

  std::vector<std::string> seen;
  std::size_t limit = 1000000;

 private:
  static std::string formatted(const char* kind, const ObjectPath& path) {
    const NamedValue* const key = path.find("InstanceID");
    return kind + std::string(key == nullptr ? "without key" : text(key->data).value_or("-"));
  }
  bool add(std::string what) {
    seen.push_back(std::move(what));
    return seen.size() < limit;
  }
};

class ResultTest : public BrokerTest {
 protected:
  CMPIInstance* thing(const char* id) { return eft_->newInstance(mb_, newKeyedPath(id), nullptr); }
  Recorder sink_;
};

TEST_F(ResultTest, HandsOnEachObjectAtOnce) {
  Result result(sink_, request_);
  const CMPIResult* const handle = &result;
  EXPECT_EQ(handle->ft->returnInstance(handle, thing("1")).rc, CMPI_RC_OK);
  EXPECT_EQ(sink_.seen, std::vector<std::string>{"instance 1"});
  EXPECT_EQ(handle->ft->returnObjectPath(handle, newKeyedPath("2")).rc, CMPI_RC_OK);
  const CMPIValue* const value = chars("3");
  EXPECT_EQ(handle->ft->returnData(handle, value, CMPI_chars).rc, CMPI_RC_OK);
  CMPIValue object{};
  object.inst = thing("4");
  EXPECT_EQ(handle->ft->returnData(handle, &object, CMPI_instance).rc, CMPI_RC_OK);
  object.ref = newKeyedPath("5");
  EXPECT_EQ(handle->ft->returnData(handle, &object, CMPI_ref).rc, CMPI_RC_OK);
  EXPECT_FALSE(result.done());
  EXPECT_EQ(handle->ft->returnDone(handle).rc, CMPI_RC_OK);
  EXPECT_EQ(sink_.seen,
            (std::vector<std::string>{"instance 1", "path 2", "data 3", "instance 4", "path 5", "done"}));
  EXPECT_TRUE(result.done());
  EXPECT_EQ(result.delivered(), 5U);
  EXPECT_EQ(result.refused(), 0U);
}

TEST_F(ResultTest, RefusesNullsAndForeignObjects) {
  Result result(sink_, request_);
  const CMPIResult* const handle = &result;
  CMPIInstance foreign{&foreign, nullptr};
  EXPECT_EQ(handle->ft->returnInstance(handle, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(handle->ft->returnInstance(handle, &foreign).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(handle->ft->returnObjectPath(handle, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(handle->ft->returnData(handle, nullptr, CMPI_string).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  EXPECT_EQ(handle->ft->returnData(handle, nullptr, CMPI_instance).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  const CMPIValue* const value = chars("x");
  EXPECT_EQ(handle->ft->returnData(handle, value, CMPI_enumeration).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
  EXPECT_TRUE(sink_.seen.empty());
  EXPECT_EQ(result.delivered(), 0U);
  EXPECT_EQ(result.refused(), 6U);
}

TEST_F(ResultTest, TakesNothingAfterTheDoneMarker) {
  Result result(sink_, request_);
  const CMPIResult* const handle = &result;
  handle->ft->returnDone(handle);
  EXPECT_EQ(handle->ft->returnInstance(handle, thing("late")).rc, CMPI_RC_ERR_FAILED);
  EXPECT_EQ(handle->ft->returnDone(handle).rc, CMPI_RC_OK);
  EXPECT_EQ(sink_.seen, std::vector<std::string>{"done"});
  EXPECT_EQ(result.refused(), 1U);
}

TEST_F(ResultTest, ASinkThatHasEnoughGetsNoMore) {
  sink_.limit = 2;
  Result result(sink_, request_);
  const CMPIResult* const handle = &result;
  for (const char* id : {"1", "2", "3"}) {
    EXPECT_EQ(handle->ft->returnInstance(handle, thing(id)).rc, CMPI_RC_OK);
  }
  handle->ft->returnDone(handle);
  EXPECT_EQ(sink_.seen, (std::vector<std::string>{"instance 1", "instance 2", "done"}));
  EXPECT_EQ(result.delivered(), 2U);
}

TEST_F(ResultTest, CannotBeClonedAndTakesNoErrors) {
  Result result(sink_, request_);
  CMPIResult* const handle = &result;
  CMPIStatus status{};
  EXPECT_EQ(handle->ft->clone(handle, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(handle->ft->returnError(handle, nullptr).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  CMPIError error{&error, nullptr};
  EXPECT_EQ(handle->ft->returnError(handle, &error).rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(handle->ft->release(handle).rc, CMPI_RC_OK);
}

TEST_F(ResultTest, RecyclingKeepsMemoryFromGrowing) {
  Result result(sink_, request_, Recycling::OnReturn);
  const CMPIResult* const handle = &result;
  handle->ft->returnInstance(handle, thing("first"));
  const std::size_t footprint = request_.arena().footprint();
  for (int round = 0; round < 10000; ++round) {
    handle->ft->returnInstance(handle, thing("next"));
  }
  EXPECT_EQ(request_.arena().footprint(), footprint);
  EXPECT_EQ(result.delivered(), 10001U);
}

TEST_F(ResultTest, RecyclingLeavesWhatTheRequestHolds) {
  ObjectPath* const path = ObjectPath::create(request_.held(), broker_.classes(), "root/test", "Test_Thing");
  const CMPIValue* const value = chars("held");
  path->addKey("InstanceID", value, CMPI_chars);
  const CMPIString* const nameSpace = path->ft->getNameSpace(path, nullptr);
  Result result(sink_, request_, Recycling::OnReturn);
  const CMPIResult* const handle = &result;
  handle->ft->returnObjectPath(handle, newKeyedPath("returned"));
  EXPECT_EQ(text(path->find("InstanceID")->data), "held");
  EXPECT_EQ(textOf(nameSpace), "root/test");
}

TEST_F(ResultTest, WithoutRecyclingObjectsStay) {
  Result result(sink_, request_);
  const CMPIResult* const handle = &result;
  CMPIInstance* const instance = thing("again");
  handle->ft->returnInstance(handle, instance);
  handle->ft->returnInstance(handle, instance);
  EXPECT_EQ(sink_.seen, (std::vector<std::string>{"instance again", "instance again"}));
}

TEST_F(ResultTest, AnEnumerationWalksAndBecomesAnArray) {
  const CMPIData elements[] = {dataOf(CMPI_ref, sample(CMPI_ref)), dataOf(CMPI_ref, sample(CMPI_ref))};
  const CMPIEnumeration* const walk = Enumeration::create(request_.held(), CMPI_ref, elements);
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  EXPECT_EQ(walk->ft->hasNext(walk, &status), 1);
  EXPECT_EQ(walk->ft->getNext(walk, &status).value.ref, elements[0].value.ref);
  EXPECT_EQ(walk->ft->getNext(walk, nullptr).value.ref, elements[1].value.ref);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(walk->ft->hasNext(walk, nullptr), 0);
  EXPECT_NE(walk->ft->getNext(walk, &status).state & CMPI_notFound, 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
  const CMPIArray* const array = walk->ft->toArray(walk, &status);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(array->ft->getSize(array, nullptr), 2U);
  EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_ref);
  EXPECT_TRUE(sameValue(array->ft->getElementAt(array, 1, nullptr), elements[1]));
}

TEST_F(ResultTest, AnEnumerationMayBeEmpty) {
  const CMPIEnumeration* const walk = Enumeration::create(request_.held(), CMPI_instance, {});
  EXPECT_EQ(walk->ft->hasNext(walk, nullptr), 0);
  const CMPIArray* const array = walk->ft->toArray(walk, nullptr);
  EXPECT_EQ(array->ft->getSize(array, nullptr), 0U);
  EXPECT_EQ(array->ft->getSimpleType(array, nullptr), CMPI_instance);
}

}  // namespace
}  // namespace cimom
