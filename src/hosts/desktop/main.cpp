// The product on a phone that exists only in software, in a window of the desktop.

#include <QGuiApplication>
#include <QQmlApplicationEngine>
#include <QQuickWindow>
#include <QTimer>
#include <chrono>
#include <cstdlib>
#include <iostream>
#include <memory>

#include <spdlog/sinks/stdout_color_sinks.h>

#include "app/AppDelegate.h"
#include "base/SpdlogSink.h"
#include "hosts/desktop/Lifecycle.h"
#include "hosts/desktop/SimulatedDesktop.h"
#include "hosts/desktop/SimulatorOptions.h"
#include "hosts/desktop/SystemAppearance.h"
#include "hosts/desktop/UnwatchedRun.h"
#include "shell/BaseViewController.h"
#include "shell/LogCategories.h"
#include "shell/view/QmlModule.h"
#include "shell/view/ShellBinding.h"

namespace {

using namespace quorl;
using desktop::SimulatorOptions;

constexpr char kTabletClass[] = "Tabrin";
constexpr QSize kPhone{390, 844};
constexpr QSize kTablet{1024, 768};

/// Gives what is still being stored a moment to get there.
void comeToRest(const desktop::SimulatedDesktop& phone) {
  const auto end = std::chrono::steady_clock::now() + std::chrono::seconds(2);
  while (!phone.isAtRest() && std::chrono::steady_clock::now() < end)
    QCoreApplication::processEvents(QEventLoop::AllEvents, 10);
}

int run(QGuiApplication& application, const SimulatorOptions& options) {
  auto programme = options.programme();
  if (!programme) {
    std::cerr << "quorl-simulator: " << programme.error() << '\n';
    return EXIT_FAILURE;
  }
  // The product has no tear-down: what is made here lives until the process ends.
  static auto* phone = new desktop::SimulatedDesktop(options.device, options.documents, *std::move(programme));
  static auto* product = new AppDelegate;
  desktop::Lifecycle lifecycle(*product);
  lifecycle.launch();
  QObject::connect(&application, &QGuiApplication::applicationStateChanged, &application,
                   [&lifecycle](Qt::ApplicationState state) { lifecycle.stateDidChange(state); });

  const desktop::SystemAppearance appearance;
  view::ShellBinding shell(*product->window(), phone->alerts());
  QQmlApplicationEngine engine;
  view::useQmlModule(engine);
  const QSize size = options.device.deviceClass == kTabletClass ? kTablet : kPhone;
  engine.setInitialProperties(
      {{"shell", QVariant::fromValue(&shell)}, {"width", size.width()}, {"height", size.height()}});
  engine.load(QUrl(view::kAppWindowUrl));
  auto* window = qobject_cast<QQuickWindow*>(engine.rootObjects().value(0));
  if (window == nullptr) return EXIT_FAILURE;
  phone->radio().start();

  desktop::UnwatchedRun unwatched(*window, shell, *product->window()->rootViewController()->rootScreen());
  if (options.prints) unwatched.printChanges();
  if (options.seconds) {
    const std::chrono::duration<double> time(*options.seconds);
    QTimer::singleShot(std::chrono::duration_cast<std::chrono::milliseconds>(time), &unwatched, [&] {
      if (options.screenshots.empty())
        QCoreApplication::quit();
      else
        unwatched.takePictures(options.screenshots);
    });
  }
  const int code = application.exec();
  lifecycle.terminate();
  comeToRest(*phone);
  return code;
}

}  // namespace

int main(int argc, char** argv) {
  QCoreApplication::setApplicationName("quorl-simulator");
  const auto options = SimulatorOptions::parse(argc, argv);
  if (!options) return options.error();
  if (options->isVerbose)
    installLogSink(std::make_shared<SpdlogSink>(log_category::kFallbackSubsystem,
                                                std::make_shared<spdlog::sinks::stderr_color_sink_mt>()));
  int code = EXIT_FAILURE;
  {
    QGuiApplication application(argc, argv);
    code = run(application, *options);
  }
  // Threads of the product still live.
  std::cout.flush();
  std::_Exit(code);
}
