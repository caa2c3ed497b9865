#pragma once

#include "hosts/simulator/network/Connection.h"
#include "hosts/simulator/network/SubscriptionCore.h"

namespace quorl::simulator::network {

/// Voice calls: over LTE and NR, over UMTS and GSM, and the ways between them: fall back for a call (TS 23.272,
/// TS 23.502 4.13.6) and hand-over of one to the circuit-switched side (TS 23.216).
class Calls final : public RadioUser {
 public:
  Calls(SubscriptionCore& core, Camping& camping, Connection& connection)
      : core_(core), camping_(camping), connection_(connection) {}

  void powerOn();
  void place(const action::PlaceCall& call);
  /// Power off, or the SIM is out.
  void drop();
  /// A round of measurements in a connection.
  void measured();
  /// Timers.
  void stepDue();
  void fallBackDue();
  void nextDue();

  void cellChanged(const Cell* from, const Cell* to) override;
  void connected() override;
  void connectionFailed() override;
  void connectionEnded(RrcCause cause) override;

 private:
  enum class Stage : std::uint8_t {
    None,
    Access,
    FallingBack,
    Moved,
    SettingUp,
    Ringing,
    Answering,
    Talking,
    Unanswered
  };

  bool isActive() const { return stage_ != Stage::None; }
  void choosePath();
  void tell(event::CallStep step);
  void failPage(event::PageFailure cause, const Cell* attempted);
  void finish(CallEnd end, std::uint8_t releaseCause);
  void goBack();
  void drawNext();

  SubscriptionCore& core_;
  Camping& camping_;
  Connection& connection_;
  Stage stage_ = Stage::None;
  action::PlaceCall wanted_;
  bool needsFallback_ = false;
  bool returnsAfterwards_ = false;
  bool isHolding_ = false;
  const Cell* pagedOn_ = nullptr;
  std::uint32_t measurements_ = 0;
};

}  // namespace quorl::simulator::network
