#pragma once

#include <QDBusConnection>
#include <QDBusVariant>
#include <QObject>
#include <QString>
#include <optional>

namespace quorl::desktop {

/// What the user has chosen in the settings of the desktop, as its portal tells (org.freedesktop.portal.Settings, with
/// the keys of org.freedesktop.appearance and org.gnome.desktop.interface). Main thread.
class DesktopPortal final : public QObject {
  Q_OBJECT

 public:
  /// The session's portal; where there is no session bus, nothing is ever known.
  static DesktopPortal* ofSession();
  /// Asks the portal of that service, and follows it from now on. Answers come later.
  DesktopPortal(const QDBusConnection& bus, const QString& service);

  /// Nothing while it is not known, or where the user has no preference.
  std::optional<bool> isDark() const { return isDark_; }
  std::optional<bool> hasReducedMotion() const { return hasReducedMotion_; }

 signals:
  void changed();

 private slots:
  void settingDidChange(const QString& group, const QString& key, const QDBusVariant& value);

 private:
  void ask(const QString& group, const QString& key);

  QDBusConnection bus_;
  const QString service_;
  std::optional<bool> isDark_;
  std::optional<bool> hasReducedMotion_;
};

}  // namespace quorl::desktop
