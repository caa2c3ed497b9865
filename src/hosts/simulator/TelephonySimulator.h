#pragma once

#include <chrono>
#include <cstdint>
#include <memory>
#include <optional>
#include <string>
#include <utility>
#include <vector>

#include "base/Queue.h"
#include "hosts/simulator/TelephonyScript.h"
#include "platform/TelephonyClient.h"

namespace quorl::simulator {

/// The telephony service of a phone that exists only in software: two slots, each with a SIM or without, a cell, a
/// signal, bands and a carrier's name, all of which change when the owner says so.
///
/// Subscriptions and delegate calls come on the client's queue, cells and measurements on a worker queue of its own,
/// always after the asking call has returned. An answer tells what was so when it was asked for. Band records answer
/// at once. An answer on its way is delivered even if its client is gone meanwhile; a delegate call is not.
///
/// Any thread. The queues of its clients must outlive it and the answers on their way.
class TelephonySimulator final : public HorvaneClientFactory {
 public:
  /// Two empty slots, and nothing fails.
  explicit TelephonySimulator(QueueFactory& queues);
  /// Drops the steps still to come; clients that live on answer with what was so at the end. The answers that wait on
  /// the worker queue are delivered, by the end of the last client at the latest.
  ~TelephonySimulator() override;
  TelephonySimulator(const TelephonySimulator&) = delete;
  TelephonySimulator& operator=(const TelephonySimulator&) = delete;

  std::unique_ptr<HorvaneClient> initWithQueue(Queue& queue) override;
  std::unique_ptr<HVTelephonyNetworkInfo> networkInfo() override;

  /// How long cells and measurements take to answer from now on; none at first.
  void setAnswerDelay(std::chrono::milliseconds delay);

  /// Does what one step of a script says, at once. A step for a slot other than 1 and 2 does nothing.
  void perform(const telephony_event::Event& event);
  /// Performs the steps of time 0 inside the call, so that whoever starts afterwards finds the phone so, and the later
  /// ones on `queue`, each at its time counted from now; steps of one time in their order. Steps still to come are
  /// dropped when the simulator goes away, whoever of its clients lives on. `queue` must outlive it.
  void play(std::vector<TelephonyScriptStep> steps, Queue& queue);

 private:
  struct State;
  class Client;
  class NetworkInfo;

  const std::shared_ptr<State> state_;
};

}  // namespace quorl::simulator
