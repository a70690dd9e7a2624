// Several requests at once, and threads that providers start.
#include "Fixture.h"

#include <cimom/broker/Context.h>

#include <atomic>
#include <thread>

namespace cimom {
namespace {

class ThreadsTest : public BrokerTest {
 protected:
  CMPIContext* context() {
    Context* const made = Context::create(request_.held());
    made->setText(CMPIPrincipal, "somebody");
    return made;
  }

  /// What a provider does for an answer: paths, instances, getters, clones.
  void work(int rounds) const {
    for (int round = 0; round < rounds; ++round) {
      CMPIObjectPath* const path = eft_->newObjectPath(mb_, "root/test", "test_thing", nullptr);
      const CMPIValue* const value = chars("id");
      ASSERT_EQ(path->ft->addKey(path, "instanceid", value, CMPI_chars).rc, CMPI_RC_OK);
      CMPIInstance* const instance = eft_->newInstance(mb_, path, nullptr);
      ASSERT_EQ(instance->ft->setProperty(instance, "Caption", value, CMPI_chars).rc, CMPI_RC_OK);
      CMPIInstance* const copy = instance->ft->clone(instance, nullptr);
      ASSERT_EQ(textOf(path->ft->getClassName(path, nullptr)), "Test_Thing");
      ASSERT_EQ(text(copy->ft->getProperty(copy, "Caption", nullptr)), "id");
      ASSERT_EQ(eft_->classPathIsA(mb_, path, "Test_Base", nullptr), 1);
      copy->ft->release(copy);
    }
  }
};

TEST_F(ThreadsTest, RequestsRunSideBySide) {
  std::vector<std::thread> threads;
  for (int count = 0; count < 8; ++count) {
    threads.emplace_back([this] {
      Request request;
      const RequestScope scope(&request);
      work(200);
    });
  }
  work(200);
  for (std::thread& thread : threads) {
    thread.join();
  }
}

TEST_F(ThreadsTest, ScopesNest) {
  Request inner;
  EXPECT_EQ(Request::current(), &request_);
  {
    const RequestScope scope(&inner);
    EXPECT_EQ(Request::current(), &inner);
    {
      const RequestScope none(nullptr);
      EXPECT_EQ(Request::current(), nullptr);
    }
    EXPECT_EQ(Request::current(), &inner);
  }
  EXPECT_EQ(Request::current(), &request_);
}

TEST_F(ThreadsTest, APreparedThreadWorksAfterItsRequestHasEnded) {
  CMPIContext* prepared = nullptr;
  {
    Request ending;
    const RequestScope scope(&ending);
    const CMPIContext* const original = Context::create(ending.held());
    const CMPIValue* const value = chars("somebody");
    original->ft->addEntry(original, CMPIPrincipal, value, CMPI_chars);
    prepared = mb_->bft->prepareAttachThread(mb_, original);
  }
  ASSERT_NE(prepared, nullptr);
  std::thread([&] {
    EXPECT_EQ(eft_->newString(mb_, "too early", nullptr), nullptr);
    EXPECT_EQ(mb_->bft->attachThread(mb_, prepared).rc, CMPI_RC_OK);
    EXPECT_EQ(text(prepared->ft->getEntry(prepared, CMPIPrincipal, nullptr)), "somebody");
    work(100);
    EXPECT_EQ(mb_->bft->detachThread(mb_, prepared).rc, CMPI_RC_OK);
    EXPECT_EQ(eft_->newString(mb_, "too late", nullptr), nullptr);
  }).join();
}

TEST_F(ThreadsTest, AThreadMayAttachWithTheRequestsOwnContext) {
  const CMPIContext* const shared = context();
  std::atomic<int> attached = 0;
  std::vector<std::thread> threads;
  for (int count = 0; count < 4; ++count) {
    threads.emplace_back([&] {
      ASSERT_EQ(mb_->bft->attachThread(mb_, shared).rc, CMPI_RC_OK);
      ++attached;
      EXPECT_EQ(text(shared->ft->getEntry(shared, CMPIPrincipal, nullptr)), "somebody");
      work(50);
      EXPECT_EQ(mb_->bft->detachThread(mb_, shared).rc, CMPI_RC_OK);
    });
  }
  for (std::thread& thread : threads) {
    thread.join();
  }
  EXPECT_EQ(attached, 4);
}

TEST_F(ThreadsTest, AThreadAttachesOnce) {
  const CMPIContext* const prepared = mb_->bft->prepareAttachThread(mb_, context());
  EXPECT_EQ(mb_->bft->attachThread(mb_, prepared).rc, CMPI_RC_ERR_FAILED);  // it has a request
  EXPECT_EQ(mb_->bft->detachThread(mb_, prepared).rc, CMPI_RC_ERR_INVALID_PARAMETER);
  std::thread([&] {
    EXPECT_EQ(mb_->bft->detachThread(mb_, prepared).rc, CMPI_RC_ERR_INVALID_PARAMETER);
    EXPECT_EQ(mb_->bft->attachThread(mb_, prepared).rc, CMPI_RC_OK);
    EXPECT_EQ(mb_->bft->attachThread(mb_, prepared).rc, CMPI_RC_ERR_FAILED);
    EXPECT_EQ(mb_->bft->detachThread(mb_, prepared).rc, CMPI_RC_OK);
  }).join();
}

// Reading what the request holds takes memory: from the reading thread's own request.
TEST_F(ThreadsTest, ThreadsReadOnePathAtOnce) {
  const CMPIObjectPath* const path = newPath("Test_Link");
  const CMPIValue reference = sample(CMPI_ref);
  path->ft->addKey(const_cast<CMPIObjectPath*>(path), "Left", &reference, CMPI_ref);
  const auto read = [&] {
    for (int round = 0; round < 200; ++round) {
      const CMPIData data = path->ft->getKey(path, "left", nullptr);
      ASSERT_EQ(textOf(data.value.ref->ft->getNameSpace(data.value.ref, nullptr)), "root/test");
    }
  };
  std::vector<std::thread> threads;
  for (int count = 0; count < 4; ++count) {
    threads.emplace_back([&] {
      Request request;
      const RequestScope scope(&request);
      read();
    });
  }
  for (std::thread& thread : threads) {
    thread.join();
  }
}

}  // namespace
}  // namespace cimom
