#include <QDBusConnection>
#include <QDBusMessage>
#include <QDBusServer>
#include <QDBusVariant>
#include <QDBusVirtualObject>
#include <QGuiApplication>
#include <QMap>
#include <QPalette>
#include <QTest>
#include <memory>
#include <optional>

#include <gtest/gtest.h>

#include "hosts/desktop/DesktopPortal.h"
#include "hosts/desktop/SystemAppearance.h"
#include "shell/view/Appearance.h"

namespace quorl {
namespace {

constexpr char kPath[] = "/org/freedesktop/portal/desktop";
constexpr char kInterface[] = "org.freedesktop.portal.Settings";

/// A portal that speaks to one client, without a bus between them.
class FakePortal final : public QDBusVirtualObject {
 public:
  FakePortal() {
    connect(&server_, &QDBusServer::newConnection, this, [this](const QDBusConnection& connection) {
      connection_ = connection;
      connection_->registerVirtualObject(kPath, this);
    });
  }
  QString introspect(const QString& /*path*/) const override { return {}; }
  bool handleMessage(const QDBusMessage& message, const QDBusConnection& connection) override {
    const auto known =
        settings.constFind(message.arguments().value(0).toString() + " " + message.arguments().value(1).toString());
    if (known == settings.constEnd())
      return connection.send(message.createErrorReply("org.freedesktop.portal.Error.NotFound", "no such setting"));
    // As portals do, in two layers.
    const QVariant inner = QVariant::fromValue(QDBusVariant(*known));
    return connection.send(message.createReply(QVariant::fromValue(QDBusVariant(inner))));
  }
  void tell(const QString& group, const QString& key, const QVariant& value) {
    QDBusMessage signal = QDBusMessage::createSignal(kPath, kInterface, "SettingChanged");
    signal << group << key << QVariant::fromValue(QDBusVariant(value));
    connection_->send(signal);
  }
  QString address() const { return server_.address(); }

  QMap<QString, QVariant> settings;

 private:
  QDBusServer server_{"unix:tmpdir=/tmp"};
  std::optional<QDBusConnection> connection_;
};

class SystemAppearanceTest : public ::testing::Test {
 protected:
  ~SystemAppearanceTest() override {
    seen.reset();
    QDBusConnection::disconnectFromPeer("portal");
    QGuiApplication::setPalette(QPalette());
    appearance.setDark(false);
    appearance.setReducedMotion(false);
  }
  void starts() {
    const QDBusConnection bus = QDBusConnection::connectToPeer(portal.address(), "portal");
    ASSERT_TRUE(bus.isConnected()) << bus.lastError().message().toStdString();
    auto* followed = new desktop::DesktopPortal(bus, QString());
    QObject::connect(followed, &desktop::DesktopPortal::changed, followed, [this] { ++changes; });
    seen = std::make_unique<desktop::SystemAppearance>(followed);
  }
  bool hasHeard(int count) {
    return QTest::qWaitFor([&] { return changes >= count; });
  }
  static void paletteIsDark() {
    QPalette palette;
    palette.setColor(QPalette::Window, Qt::black);
    palette.setColor(QPalette::WindowText, Qt::white);
    QGuiApplication::setPalette(palette);
    QCoreApplication::processEvents();
  }

  FakePortal portal;
  view::Appearance& appearance = view::Appearance::shared();
  std::unique_ptr<desktop::SystemAppearance> seen;
  int changes = 0;
};

TEST_F(SystemAppearanceTest, FollowsThePaletteWhereThereIsNoPortal) {
  const desktop::SystemAppearance alone(nullptr);
  EXPECT_FALSE(appearance.isDark());
  paletteIsDark();
  EXPECT_TRUE(appearance.isDark());
  EXPECT_FALSE(appearance.reducedMotion());
}

TEST_F(SystemAppearanceTest, IsAsTheUserHasChosenBefore) {
  portal.settings = {{"org.freedesktop.appearance color-scheme", 1U},
                     {"org.gnome.desktop.interface enable-animations", false}};
  starts();
  ASSERT_TRUE(hasHeard(2));
  EXPECT_TRUE(appearance.isDark());
  EXPECT_TRUE(appearance.reducedMotion());
}

TEST_F(SystemAppearanceTest, FollowsTheUsersChoice) {
  portal.settings = {{"org.freedesktop.appearance color-scheme", 1U},
                     {"org.gnome.desktop.interface enable-animations", true}};
  starts();
  ASSERT_TRUE(hasHeard(2));
  portal.tell("org.freedesktop.appearance", "color-scheme", 2U);
  ASSERT_TRUE(hasHeard(3));
  EXPECT_FALSE(appearance.isDark());
  paletteIsDark();
  EXPECT_FALSE(appearance.isDark()) << "the choice counts more than the palette";
  portal.tell("org.freedesktop.appearance", "color-scheme", 0U);
  ASSERT_TRUE(hasHeard(4));
  EXPECT_TRUE(appearance.isDark()) << "without a preference the palette decides";
  portal.tell("org.gnome.desktop.interface", "cursor-size", 24);
  portal.tell("org.gnome.desktop.interface", "enable-animations", false);
  ASSERT_TRUE(hasHeard(5));
  EXPECT_TRUE(appearance.reducedMotion());
}

TEST_F(SystemAppearanceTest, APortalWithoutTheSettingsChangesNothing) {
  paletteIsDark();
  portal.settings = {{"org.gnome.desktop.interface enable-animations", true}};
  starts();
  ASSERT_TRUE(hasHeard(1));
  EXPECT_TRUE(appearance.isDark());
  EXPECT_FALSE(appearance.reducedMotion());
}

}  // namespace
}  // namespace quorl
