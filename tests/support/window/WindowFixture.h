#pragma once

#include <QGuiApplication>
#include <QImage>
#include <QQmlApplicationEngine>
#include <QQuickItem>
#include <QQuickWindow>
#include <QSize>
#include <QString>
#include <chrono>
#include <memory>
#include <string>
#include <vector>

#include <gtest/gtest.h>

#include "app/AppDelegate.h"
#include "hosts/simulator/TelephonySimulator.h"
#include "platform/Platform.h"
#include "shell/view/ShellBinding.h"
#include "support/FakePlatform.h"

namespace quorl::test {

/// Collects what Qt and QML warn of while it lives.
class WarningCollector {
 public:
  WarningCollector();
  ~WarningCollector();
  WarningCollector(const WarningCollector&) = delete;
  WarningCollector& operator=(const WarningCollector&) = delete;

  /// The warnings so far; none are left.
  std::vector<std::string> take();
};

/// Animations run by the steps of a test, not by the time of day.
class SteppedAnimations;

/// A window with the whole product in it, on a fake phone in virtual time: no time passes unless a test says so, and
/// nothing runs on other threads. Use it inside a test, or as a base of fixtures.
class WindowPhone {
 public:
  WindowPhone();
  ~WindowPhone();
  WindowPhone(const WindowPhone&) = delete;
  WindowPhone& operator=(const WindowPhone&) = delete;

  // Before `launch`.
  void isDevice(const std::string& chipset);
  void isInternalBuild() { phone.properties.booleans["InternalBuild"] = true; }
  void isCarrierBuild() { phone.properties.booleans["CarrierInstallCapability"] = true; }
  /// Log capture is possible on the device.
  void hasLogCapture() { phone.properties.classes.emplace_back("Sondrel"); }
  void setSize(int width, int height);

  /// Starts the product, loads the window and shows it.
  void launch();

  /// Lets `duration` pass for the product and for animations alike, in frames.
  void pass(std::chrono::milliseconds duration);
  /// Does all that is due at this moment.
  void settle();

  QQuickWindow& window() { return *window_; }
  QQmlApplicationEngine& engine() { return *engine_; }
  AppDelegate& application() { return *application_; }

  /// The first item of that name that is shown, or null; the search goes down from `root`, or from the window.
  QQuickItem* find(const QString& objectName, QQuickItem* root = nullptr);
  /// All shown items of that name, in the order in which the scene holds them.
  std::vector<QQuickItem*> findAll(const QString& objectName, QQuickItem* root = nullptr);
  bool isShown(const QString& objectName) { return find(objectName) != nullptr; }
  /// The property "text" of an item, "" if there is no such item.
  std::string text(const QString& objectName);
  /// The texts of all shown items below `root` that have one, in scene order.
  std::vector<std::string> texts(QQuickItem* root = nullptr);

  // As a finger or a keyboard would. The item must be shown.
  void tap(const QString& objectName) { tap(find(objectName)); }
  void tap(QQuickItem* item);
  void longPress(QQuickItem* item);
  /// Moves a finger from the item's middle by (dx, dy).
  void swipe(QQuickItem* item, int dx, int dy);
  void key(Qt::Key key, Qt::KeyboardModifiers modifiers = Qt::NoModifier);

  /// What the window shows now.
  QImage grab();
  /// The same without what earlier frames may have left: all is drawn when everything's opacity changes.
  QImage drawnAnew();

  /// Warnings since the last call; a fixture fails on any at its end.
  std::vector<std::string> takeWarnings() { return warnings_.take(); }

  FakePlatform phone;
  simulator::TelephonySimulator telephony;

 private:
  void frame();

  WarningCollector warnings_;
  view::AlertsBinding alerts_;
  Platform platform_;
  std::unique_ptr<AppDelegate> application_;
  std::unique_ptr<view::ShellBinding> shell_;
  std::unique_ptr<QQmlApplicationEngine> engine_;
  std::unique_ptr<SteppedAnimations> animations_;
  QQuickWindow* window_ = nullptr;
  QSize size_{390, 844};
};

/// A test with a window. It fails when anything warned.
class WindowTest : public ::testing::Test, protected WindowPhone {
 protected:
  void TearDown() override;
};

/// Makes the `QGuiApplication` of a program that shows windows offscreen, drawn in software. To be called first in
/// `main`; the arguments must outlive it.
std::unique_ptr<QGuiApplication> makeOffscreenApplication(int& argc, char** argv);

}  // namespace quorl::test
