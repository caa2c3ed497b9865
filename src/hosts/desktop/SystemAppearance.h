#pragma once

#include <QObject>

#include "hosts/desktop/DesktopPortal.h"

namespace quorl::desktop {

/// Keeps `view::Appearance` as the desktop wants it: light or dark, the scale of type, and how much may move. Main
/// thread.
class SystemAppearance final : public QObject {
 public:
  /// Follows the application and the session's portal from now on.
  SystemAppearance() : SystemAppearance(DesktopPortal::ofSession()) {}
  /// Follows the application and `portal`, which may be null and belongs to it from now on. What the portal does not
  /// know is as the application's palette has it.
  explicit SystemAppearance(DesktopPortal* portal);

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  void take() const;

  DesktopPortal* const portal_;
};

}  // namespace quorl::desktop
