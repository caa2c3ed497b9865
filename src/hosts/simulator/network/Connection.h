#pragma once

#include <cstdint>

#include "hosts/simulator/network/Camping.h"
#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// Radio resource control: random access, set-up, resumption, re-establishment and release of the one connection that a
/// subscription can have (TS 36.331, TS 38.331, TS 25.331).
class Connection {
 public:
  Connection(SubscriptionCore& core, Camping& camping) : core_(core), camping_(camping) {}

  /// Asks for a connection. With one there already the users hear nothing more; false: there is no cell for it.
  bool request(RrcCause cause);
  /// Keeps the connection as long as somebody holds it.
  void hold() { ++holders_; }
  void letGo();
  bool isHeld() const { return holders_ > 0; }
  /// Something was sent or received.
  void touch();
  /// Without holder: ends it after this long.
  void releaseAfter(SimulatedMs milliseconds);
  /// Ends it now.
  void release(RrcCause cause);
  /// Ends it and goes to another cell in idle.
  void redirect(const Cell& target);
  /// Goes on on another cell, by handover; on one of another technology with that one's states.
  void moveTo(const Cell& target);
  /// The radio link is gone: looks for a cell to go on.
  void reestablish(RrcCause cause);
  /// Power off, SIM out: nothing more is sent.
  void drop();

  /// Timers.
  void accessTried();
  void setUp();
  void released();
  void inactive();
  void reestablishTried();

  /// Random access on a cell, once; tells of it. The result decides nothing yet.
  bool tryAccess(const Cell& cell, event::RachReason reason, bool isContentionBased);

 private:
  void startAccess(event::RachReason reason);
  void accessFailed();
  void begin(RrcCause cause);
  void end(event::ConnectionEnd end, RrcCause cause);
  void connectedDrx(bool isConnected);
  void idleAgain(RrcCause cause);
  static bool usesCellStates(Technology technology) { return technology == Technology::Umts; }

  SubscriptionCore& core_;
  Camping& camping_;
  RrcCause cause_ = RrcCause::None;
  RrcCause pending_ = RrcCause::None;  // asked for while the last one was ending
  const Cell* target_ = nullptr;       // of a redirection
  event::RachReason reason_ = event::RachReason::InitialAccess;
  std::uint8_t attempts_ = 0;
  std::uint32_t holders_ = 0;
  SimulatedMs askedMs_ = 0;
  SimulatedMs searchUntilMs_ = 0;  // T311
  bool isResumption_ = false;
};

}  // namespace quorl::simulator::network
