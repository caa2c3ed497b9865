#pragma once

#include <chrono>
#include <functional>
#include <memory>
#include <string>
#include <utility>
#include <vector>

#include "platform/SondrelLibrary.h"

namespace quorl::test {

/// A collected file of 32 KB, of 2026-01-05 09:30:12 UTC.
inline SondrelFileInformation logFile(std::string name) {
  return {std::move(name), "32 KB", Date(std::chrono::seconds(1767605412))};
}

/// A capture library that records its calls and calls back when a test says so.
class FakeSondrelFactory final : public SondrelFactory {
 public:
  std::unique_ptr<Sondrel> makeSondrel() override {
    if (!isAvailable) return nullptr;
    calls.emplace_back("construct");
    return std::make_unique<Library>(*this);
  }

  /// False for a device on which the object cannot be made.
  bool isAvailable = true;
  std::vector<std::string> calls;
  std::function<void(const std::string& call)> onCall;
  std::vector<SondrelConfiguration> started;
  std::weak_ptr<SondrelDelegate> delegate;

 private:
  class Library final : public Sondrel {
   public:
    explicit Library(FakeSondrelFactory& factory) : factory_(factory) {}
    void setDelegate(std::weak_ptr<SondrelDelegate> listener) override {
      factory_.record("setDelegate");
      factory_.delegate = std::move(listener);
    }
    void start(const SondrelConfiguration& configuration) override {
      factory_.record("start");
      factory_.started.push_back(configuration);
    }
    void stop() override { factory_.record("stop"); }
    void reset() override { factory_.record("reset"); }
    void getConfigurationList() override { factory_.record("getConfigurationList"); }

   private:
    FakeSondrelFactory& factory_;
  };

  void record(std::string call) {
    if (onCall) onCall(call);
    calls.push_back(std::move(call));
  }
};

}  // namespace quorl::test
