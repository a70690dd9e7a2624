// The operations that change instances, and queries: each goes to one provider, whose answer is passed on.
//
// Threads: requests may come from several at once.
#pragma once

#include <cimom/Outcome.h>
#include <cimom/ProviderCall.h>
#include <cimom/Routes.h>
#include <cimom/broker/Objects.h>
#include <cimom/broker/Result.h>

#include <string_view>

namespace cimom {

class Dispatcher;

class Changes {
 public:
  /// The dispatcher owns this.
  explicit Changes(const Dispatcher& dispatcher) : dispatcher_(dispatcher) {}

  // As `ObjectManager` has them. The path of what is asked has the namespace that counts, whatever the
  // instance's own says.

  Outcome create(const Asked& asked, const Instance& instance, ResultSink& sink) const;
  Outcome modify(const Asked& asked, const Instance& instance) const;
  Outcome remove(const Asked& asked) const;
  /// The class of the path means nothing: that of the query counts.
  Outcome query(const Asked& asked, std::string_view query, std::string_view language,
                ResultSink& sink) const;

 private:
  enum class Keys { Some, All };

  /// The provider that is to be asked; else null, and `status` says why.
  const Route* routeTo(const ObjectPath& path, Keys keys, Status& status) const;

  const Dispatcher& dispatcher_;
};

}  // namespace cimom
