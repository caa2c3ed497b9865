// The product on a phone that exists only in software, in a window of the desktop.

#include <QGuiApplication>
#include <QQmlApplicationEngine>
#include <QQuickWindow>
#include <QTimer>
#include <chrono>
#include <clocale>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <memory>
#include <optional>
#include <string>
#include <system_error>
#include <utility>

#include <spdlog/sinks/stdout_color_sinks.h>

#include "app/AppDelegate.h"
#include "base/SpdlogSink.h"
#include "hosts/desktop/Lifecycle.h"
#include "hosts/desktop/QuitOnSignal.h"
#include "hosts/desktop/SimulatedDesktop.h"
#include "hosts/desktop/SimulatorOptions.h"
#include "hosts/desktop/SystemAppearance.h"
#include "hosts/desktop/UnwatchedRun.h"
#include "shell/BaseViewController.h"
#include "shell/LogCategories.h"
#include "shell/view/QmlModule.h"
#include "shell/view/ShellBinding.h"
#include "store/DBManager.h"

namespace {

using namespace quorl;
using desktop::SimulatorOptions;

constexpr char kTabletClass[] = "Tabrin";
constexpr QSize kPhone{390, 844};
constexpr QSize kTablet{1024, 768};

/// A system that has no language, such as a bare container, reads the English string table rather than raw names.
void readEnglishWithoutALanguage() {
  const std::string language = std::setlocale(LC_MESSAGES, nullptr);
  if (language != "C" && language != "POSIX" && language != "C.UTF-8") return;
  std::setlocale(LC_MESSAGES, "C.UTF-8");
  setenv("LANGUAGE", "en", /*overwrite=*/0);
}

int fail(const std::string& text) {
  std::cerr << "quorl-simulator: " << text << '\n';
  return EXIT_FAILURE;
}

/// Gives a phone without a database the history that was asked for. The error is a line for the user.
tl::expected<void, std::string> makeHistory(const SimulatorOptions& options, const desktop::Programme& programme) {
  const std::optional<std::string> file = databasePath();
  std::error_code ignored;
  if (!file || std::filesystem::exists(*file, ignored)) return {};
  const auto plan = options.history(programme, SystemClock().now());
  if (!plan) return {};
  const auto made = simulator::writeHistory(*file, *plan, {});
  if (!made) return tl::unexpected(made.error());
  std::cerr << "quorl-simulator: a history of " << made->rows << " rows over " << plan->days << " days is in " << *file
            << '\n';
  return {};
}

int run(QGuiApplication& application, const SimulatorOptions& options) {
  auto programme = options.programme();
  if (!programme) return fail(programme.error());
  // The product has no tear-down: what is made here lives until the process ends.
  static auto* phone = new desktop::SimulatedDesktop(options.device, options.documents);
  if (const auto made = makeHistory(options, *programme); !made) return fail(made.error());
  if (const auto ready = phone->tuneIn(*std::move(programme)); !ready) return fail(ready.error());
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
  phone->startRadio();

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
  if (const auto whole = phone->stopRadio(); !whole && !options.record.empty())
    return fail(options.record.string() + ": " + whole.error());
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
    readEnglishWithoutALanguage();
    const desktop::QuitOnSignal quitting;
    code = run(application, *options);
  }
  // Threads of the product still live.
  std::cout.flush();
  std::_Exit(code);
}
