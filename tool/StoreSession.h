#pragma once

#include <cstdint>
#include <memory>
#include <string>

#include <tl/expected.hpp>

#include "Commands.h"
#include "hosts/simulator/SimulatedPhone.h"
#include "store/PersistanceStore.h"

namespace quorl::tool {

/// What all subcommands on a database ask for.
struct StoreOptions {
  std::string documents;
  std::int32_t subscription = 0;
  std::string chipset;  // empty: the family of the stored metrics
  bool isInternalBuild = false;
  bool isCarrierBuild = false;
  bool isVerbose = false;
  bool asJson = false;
};

/// Adds the options to `command`, "--json" only if its result is a table. `options` must outlive the parsing.
void addStoreOptions(Command& command, StoreOptions& options, bool isTable);

/// The product's store on a database that is there already, on a phone without a baseband. Like every start of the
/// product it drops the rows of thirty days ago and older. The product has no tear-down: a process opens one at most,
/// and it lives until the process ends.
class StoreSession {
 public:
  /// The error says in one line why the database cannot be used.
  static tl::expected<StoreSession*, std::string> open(const StoreOptions& options);

  const std::shared_ptr<PersistanceStore>& store() const { return store_; }
  simulator::SimulatedPhone& phone() { return phone_; }
  /// Waits until the product has nothing left to do now.
  void settle() { phone_.runUntilAtRest(); }
  /// Leaves a database file that is whole without its write-ahead log. Answers the exit code: `exitCode` unless this
  /// fails, which the user is told.
  int finish(int exitCode);

 private:
  StoreSession(const StoreOptions& options, std::string chipset);

  const std::string documents_;
  simulator::SimulatedPhone phone_;
  std::shared_ptr<PersistanceStore> store_;
};

/// Opens a session and does `work` with it, which answers the exit code.
template <typename Work>
int withStore(const StoreOptions& options, Work work) {
  const auto session = StoreSession::open(options);
  if (!session) {
    complain(session.error());
    return kFailure;
  }
  return (*session)->finish(work(**session));
}

}  // namespace quorl::tool
