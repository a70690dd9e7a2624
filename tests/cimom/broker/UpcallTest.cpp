#include "Fixture.h"

#include <cimom/broker/Context.h>
#include <cimom/broker/WbemUri.h>

#include <stdexcept>

namespace cimom {
namespace {

/// Writes down each request and answers with two paths or instances, from a request of its own.
class Answering : public UpcallTarget {
 public:
  std::string asked;
  UpcallStatus status;
  bool isEmpty = false;
  bool throws = false;

  UpcallStatus enumerateInstances(const Context& context, const ObjectPath& path, const char** properties,
                                  ResultSink& sink) override {
    return answer("enumerateInstances", context, path, properties, {}, sink, true);
  }
  UpcallStatus enumerateInstanceNames(const Context& context, const ObjectPath& path,
                                      ResultSink& sink) override {
    return answer("enumerateInstanceNames", context, path, nullptr, {}, sink, false);
  }
  UpcallStatus getInstance(const Context& context, const ObjectPath& path, const char** properties,
                           ResultSink& sink) override {
    return answer("getInstance", context, path, properties, {}, sink, true);
  }
  UpcallStatus associators(const Context& context, const ObjectPath& path, const AssociationFilter& filter,
                           const char** properties, ResultSink& sink) override {
    return answer("associators", context, path, properties, filter, sink, true);
  }
  UpcallStatus associatorNames(const Context& context, const ObjectPath& path,
                               const AssociationFilter& filter, ResultSink& sink) override {
    return answer("associatorNames", context, path, nullptr, filter, sink, false);
  }
  UpcallStatus references(const Context& context, const ObjectPath& path, const AssociationFilter& filter,
                          const char** properties, ResultSink& sink) override {
    return answer("references", context, path, properties, filter, sink, true);
  }
  UpcallStatus referenceNames(const Context& context, const ObjectPath& path, const AssociationFilter& filter,
                              ResultSink& sink) override {
    return answer("referenceNames", context, path, nullptr, filter, sink, false);
  }

 private:
  UpcallStatus answer(const char* what, const Context& context, const ObjectPath& path,
                      const char** properties, const AssociationFilter& filter, ResultSink& sink,
                      bool wantsInstances) {
    asked = std::string(what) + " " + formatWbemUri(path);
    asked += " as " + std::string(text(context.entries().find(CMPIPrincipal)->data).value_or("-"));
    for (const char** name = properties; name != nullptr && *name != nullptr; ++name) {
      asked += std::string(" ") + *name;
    }
    for (const char* part : {filter.associationClass, filter.resultClass, filter.role, filter.resultRole}) {
      asked += part == nullptr ? "" : std::string(" ") + part;
    }
    if (throws) {
      throw std::runtime_error("out of order");
    }
    Request nested;
    const RequestScope scope(&nested);
    for (const char* id : {"one", "two"}) {
      ObjectPath* const made = ObjectPath::create(nested.arena(), path.classes(), "root/test", "Test_Thing");
      const CMPIValue* const value = chars(id);
      made->addKey("InstanceID", value, CMPI_chars);
      if (!isEmpty) {
        (void)(wantsInstances ? sink.instance(*Instance::create(nested.arena(), *made)) : sink.path(*made));
      }
    }
    return status;
  }
};

// The target must be there before the broker of the base class is.
struct TargetHolder {
  Answering target_;
};

class UpcallTest : private TargetHolder, public BrokerTest {
 protected:
  UpcallTest() : BrokerTest(&target_) {
    Context* const context = Context::create(request_.held());
    context->setText(CMPIPrincipal, "me");
    context_ = context;
    path_ = newKeyedPath("asked for");
  }

  using TargetHolder::target_;

  static std::string idOf(const ObjectPath* path) {
    return path == nullptr ? "none" : std::string(text(path->find("InstanceID")->data).value_or("-"));
  }
  /// The InstanceIDs of an answer.
  static std::vector<std::string> ids(const CMPIEnumeration* answer) {
    std::vector<std::string> found;
    while (answer->ft->hasNext(answer, nullptr) != 0) {
      const CMPIData data = answer->ft->getNext(answer, nullptr);
      found.push_back(idOf(data.type == CMPI_ref ? objectPath(data) : &instance(data)->path()));
    }
    return found;
  }

  const CMPIBrokerFT& bft_ = *mb_->bft;
  const CMPIContext* context_ = nullptr;
  const CMPIObjectPath* path_ = nullptr;
  const std::string source_ = "root/test:Test_Thing.InstanceID=\"asked for\" as me";
  const std::vector<std::string> both_ = {"one", "two"};
};

TEST_F(UpcallTest, EachRequestReachesTheTargetWithAllItsArguments) {
  const char* properties[] = {"Caption", "String", nullptr};
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  EXPECT_EQ(ids(bft_.enumerateInstances(mb_, context_, path_, properties, &status)), both_);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(target_.asked, "enumerateInstances " + source_ + " Caption String");
  EXPECT_EQ(ids(bft_.enumerateInstanceNames(mb_, context_, path_, &status)), both_);
  EXPECT_EQ(target_.asked, "enumerateInstanceNames " + source_);
  const CMPIInstance* const found = bft_.getInstance(mb_, context_, path_, properties, &status);
  EXPECT_EQ(idOf(&Instance::from(found)->path()), "one");
  EXPECT_EQ(target_.asked, "getInstance " + source_ + " Caption String");
  EXPECT_EQ(ids(bft_.associators(mb_, context_, path_, "A", "R", "r", "rr", properties, &status)), both_);
  EXPECT_EQ(target_.asked, "associators " + source_ + " Caption String A R r rr");
  EXPECT_EQ(ids(bft_.associatorNames(mb_, context_, path_, "A", nullptr, nullptr, "rr", &status)), both_);
  EXPECT_EQ(target_.asked, "associatorNames " + source_ + " A rr");
  EXPECT_EQ(ids(bft_.references(mb_, context_, path_, "R", "r", properties, &status)), both_);
  EXPECT_EQ(target_.asked, "references " + source_ + " Caption String R r");
  EXPECT_EQ(ids(bft_.referenceNames(mb_, context_, path_, nullptr, nullptr, &status)), both_);
  EXPECT_EQ(target_.asked, "referenceNames " + source_);
  EXPECT_EQ(status.rc, CMPI_RC_OK);
}

TEST_F(UpcallTest, AnswersOutlastRecycling) {
  const CMPIEnumeration* const answer = bft_.enumerateInstances(mb_, context_, path_, nullptr, nullptr);
  const CMPIInstance* const first = answer->ft->getNext(answer, nullptr).value.inst;
  static_cast<void>(first->ft->getObjectPath(first, nullptr));  // a copy, which goes with the recycling
  request_.recycle();
  EXPECT_EQ(idOf(ObjectPath::from(first->ft->getObjectPath(first, nullptr))), "one");
  EXPECT_EQ(ids(answer), std::vector<std::string>{"two"});
}

TEST_F(UpcallTest, AFailureIsNullWithItsStatusAndText) {
  target_.status = {CMPI_RC_ERR_ACCESS_DENIED, "not for you"};
  CMPIStatus status{};
  EXPECT_EQ(bft_.enumerateInstances(mb_, context_, path_, nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_ACCESS_DENIED);
  EXPECT_EQ(textOf(status.msg), "not for you");
  EXPECT_EQ(bft_.getInstance(mb_, context_, path_, nullptr, nullptr), nullptr);
}

TEST_F(UpcallTest, AnExceptionEndsInTheBroker) {
  target_.throws = true;
  CMPIStatus status{};
  EXPECT_EQ(bft_.associatorNames(mb_, context_, path_, nullptr, nullptr, nullptr, nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
  EXPECT_EQ(textOf(status.msg), "out of order");
}

TEST_F(UpcallTest, AnEmptyAnswerIsAnEmptyEnumerationAndNoInstance) {
  target_.isEmpty = true;
  CMPIStatus status{CMPI_RC_ERROR, nullptr};
  EXPECT_TRUE(ids(bft_.enumerateInstanceNames(mb_, context_, path_, &status)).empty());
  EXPECT_EQ(status.rc, CMPI_RC_OK);
  EXPECT_EQ(bft_.getInstance(mb_, context_, path_, nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_FOUND);
}

TEST_F(UpcallTest, WhatTheTargetDoesNotOfferIsNotSupported) {
  const CMPIArgs* const args = eft_->newArgs(mb_, nullptr);
  const CMPIValue* const value = chars("x");
  CMPIStatus status{};
  EXPECT_EQ(bft_.createInstance(mb_, context_, path_, newThing(), &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(bft_.modifyInstance(mb_, context_, path_, newThing(), nullptr).rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(bft_.deleteInstance(mb_, context_, path_).rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(bft_.execQuery(mb_, context_, path_, "q", "l", &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_NE(bft_.invokeMethod(mb_, context_, path_, "m", args, nullptr, &status).state & CMPI_nullValue, 0);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(bft_.setProperty(mb_, context_, path_, "p", value, CMPI_chars).rc, CMPI_RC_ERR_NOT_SUPPORTED);
  EXPECT_EQ(bft_.setProperty(mb_, context_, path_, "p", value, CMPI_args).rc, CMPI_RC_ERR_INVALID_DATA_TYPE);
  (void)bft_.getProperty(mb_, context_, path_, "p", &status);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

class WithoutTarget : public BrokerTest {};

TEST_F(WithoutTarget, NoUpcallIsSupported) {
  CMPIStatus status{};
  const CMPIContext* const context = Context::create(request_.held());
  EXPECT_EQ(mb_->bft->enumerateInstances(mb_, context, newPath(), nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_NOT_SUPPORTED);
}

TEST_F(WithoutTarget, AThreadWithoutARequestGetsAStatus) {
  const CMPIContext* const context = Context::create(request_.held());
  const CMPIObjectPath* const path = newPath();
  const RequestScope outside(nullptr);
  CMPIStatus status{};
  EXPECT_EQ(mb_->bft->enumerateInstances(mb_, context, path, nullptr, &status), nullptr);
  EXPECT_EQ(status.rc, CMPI_RC_ERR_FAILED);
}

}  // namespace
}  // namespace cimom
