#pragma once

#include <QObject>

namespace quorl::desktop {

/// Keeps `view::Appearance` as the desktop wants it: light or dark and the scale of type. Main thread.
class SystemAppearance final : public QObject {
 public:
  /// Follows the application from now on.
  SystemAppearance();

 protected:
  bool eventFilter(QObject* watched, QEvent* event) override;

 private:
  static void take();
};

}  // namespace quorl::desktop
