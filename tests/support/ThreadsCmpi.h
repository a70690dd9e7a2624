// One broker for many threads at once: what a thread makes through it belongs to the thread's own small CMPI,
// so that nothing is locked between them but what is under test.
#pragma once

#include "tests/support/FakeCmpi.h"

namespace tests {

class ThreadsCmpi {
 public:
  ThreadsCmpi();
  ThreadsCmpi(const ThreadsCmpi&) = delete;
  ThreadsCmpi& operator=(const ThreadsCmpi&) = delete;

  [[nodiscard]] const CMPIBroker* broker() const { return &broker_; }

  /// Has the calling thread's calls go to `own`, until the next such call.
  static void enter(FakeCmpi& own) { current() = &own; }

 private:
  static FakeCmpi*& current() {
    static thread_local FakeCmpi* own = nullptr;
    return own;
  }

  template <auto Member>
  struct ToThread;
  template <typename Answer, typename... Arguments,
            Answer (*CMPIBrokerEncFT::*Member)(const CMPIBroker*, Arguments...)>
  struct ToThread<Member> {
    static Answer call(const CMPIBroker*, Arguments... arguments) {
      return (current()->factory.*Member)(current()->broker(), arguments...);
    }
  };
  template <typename Answer, typename... Arguments,
            Answer (*CMPIBrokerFT::*Member)(const CMPIBroker*, Arguments...)>
  struct ToThread<Member> {
    static Answer call(const CMPIBroker*, Arguments... arguments) {
      return (current()->upcalls.*Member)(current()->broker(), arguments...);
    }
  };

  CMPIBrokerFT upcalls_{};
  CMPIBrokerEncFT factory_{};
  CMPIBroker broker_{};
};

inline ThreadsCmpi::ThreadsCmpi() {
  factory_.ftVersion = CMPICurrentVersion;
  factory_.newObjectPath = ToThread<&CMPIBrokerEncFT::newObjectPath>::call;
  factory_.newInstance = ToThread<&CMPIBrokerEncFT::newInstance>::call;
  factory_.newString = ToThread<&CMPIBrokerEncFT::newString>::call;
  factory_.newArray = ToThread<&CMPIBrokerEncFT::newArray>::call;
  factory_.newDateTimeFromChars = ToThread<&CMPIBrokerEncFT::newDateTimeFromChars>::call;
  factory_.classPathIsA = ToThread<&CMPIBrokerEncFT::classPathIsA>::call;
  upcalls_.brokerVersion = CMPICurrentVersion;
  upcalls_.brokerName = "ThreadsCmpi";
  upcalls_.enumerateInstances = ToThread<&CMPIBrokerFT::enumerateInstances>::call;
  broker_.bft = &upcalls_;
  broker_.eft = &factory_;
}

}  // namespace tests
