#include "hosts/desktop/DesktopPortal.h"

#include <QDBusMessage>
#include <QDBusPendingCallWatcher>
#include <QDBusPendingReply>
#include <QFileInfo>

namespace quorl::desktop {
namespace {

constexpr char kService[] = "org.freedesktop.portal.Desktop";
constexpr char kPath[] = "/org/freedesktop/portal/desktop";
constexpr char kInterface[] = "org.freedesktop.portal.Settings";

constexpr char kAppearance[] = "org.freedesktop.appearance";
constexpr char kColorScheme[] = "color-scheme";
constexpr char kGnomeInterface[] = "org.gnome.desktop.interface";
constexpr char kEnableAnimations[] = "enable-animations";

// Values of color-scheme; 0 is no preference.
constexpr uint kPrefersDark = 1;
constexpr uint kPrefersLight = 2;

/// Asking for a bus where there is none may start one.
bool hasSessionBus() {
  return qEnvironmentVariableIsSet("DBUS_SESSION_BUS_ADDRESS") ||
         QFileInfo::exists(qEnvironmentVariable("XDG_RUNTIME_DIR") + "/bus");
}

/// A value as it was meant: a portal wraps it once more than its callers do.
QVariant unwrapped(QVariant value) {
  while (value.canConvert<QDBusVariant>()) value = value.value<QDBusVariant>().variant();
  return value;
}

}  // namespace

DesktopPortal* DesktopPortal::ofSession() {
  if (!hasSessionBus()) return nullptr;
  return new DesktopPortal(QDBusConnection::sessionBus(), kService);
}

DesktopPortal::DesktopPortal(const QDBusConnection& bus, const QString& service) : bus_(bus), service_(service) {
  bus_.connect(service, kPath, kInterface, "SettingChanged", this,
               SLOT(settingDidChange(QString, QString, QDBusVariant)));
  ask(kAppearance, kColorScheme);
  ask(kGnomeInterface, kEnableAnimations);
}

void DesktopPortal::ask(const QString& group, const QString& key) {
  QDBusMessage question = QDBusMessage::createMethodCall(service_, kPath, kInterface, "Read");
  question << group << key;
  auto* watcher = new QDBusPendingCallWatcher(bus_.asyncCall(question), this);
  connect(watcher, &QDBusPendingCallWatcher::finished, this, [this, group, key](QDBusPendingCallWatcher* call) {
    const QDBusPendingReply<QDBusVariant> reply = *call;
    // A desktop without a portal, or without the key, has no preference.
    if (reply.isValid()) settingDidChange(group, key, reply.value());
    call->deleteLater();
  });
}

void DesktopPortal::settingDidChange(const QString& group, const QString& key, const QDBusVariant& value) {
  const QVariant plain = unwrapped(QVariant::fromValue(value));
  if (group == kAppearance && key == kColorScheme) {
    const uint scheme = plain.toUInt();
    isDark_ = scheme == kPrefersDark || scheme == kPrefersLight ? std::optional(scheme == kPrefersDark) : std::nullopt;
  } else if (group == kGnomeInterface && key == kEnableAnimations) {
    hasReducedMotion_ = !plain.toBool();
  } else {
    return;
  }
  emit changed();
}

}  // namespace quorl::desktop
