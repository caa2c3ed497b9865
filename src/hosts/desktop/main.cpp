// The product on a phone that exists only in software, in a window of the desktop.

#include <QGuiApplication>
#include <QQmlApplicationEngine>
#include <QQuickWindow>
#include <algorithm>
#include <chrono>
#include <clocale>
#include <csignal>
#include <cstdlib>
#include <filesystem>
#include <iostream>
#include <memory>
#include <optional>
#include <string>
#include <system_error>
#include <utility>

#include <fcntl.h>
#include <fmt/format.h>
#include <spdlog/sinks/stdout_color_sinks.h>
#include <unistd.h>

#include "app/AppDelegate.h"
#include "base/SpdlogSink.h"
#include "hosts/desktop/Lifecycle.h"
#include "hosts/desktop/LostRows.h"
#include "hosts/desktop/QtQueue.h"
#include "hosts/desktop/QuitOnSignal.h"
#include "hosts/desktop/RecordPipe.h"
#include "hosts/desktop/SimulatedDesktop.h"
#include "hosts/desktop/SimulatorOptions.h"
#include "hosts/desktop/SystemAppearance.h"
#include "hosts/desktop/Tell.h"
#include "hosts/desktop/UnwatchedRun.h"
#include "hosts/simulator/UsableDocuments.h"
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

/// A standard file that the program was started without would be the next file that is opened, and what is printed
/// would go there. To be written, it stays unusable.
void fillStandardFiles() {
  int opened = ::open("/dev/null", O_RDONLY);
  while (opened >= 0 && opened <= STDERR_FILENO) opened = ::open("/dev/null", O_RDONLY);
  if (opened >= 0) ::close(opened);
}

int fail(const std::string& text) {
  desktop::tell(text);
  return EXIT_FAILURE;
}

/// Gives a phone without a database the history that was asked for. The error is a line for the user.
tl::expected<void, std::string> makeHistory(const SimulatorOptions& options, const desktop::Programme& programme,
                                            const desktop::QuitOnSignal& quitting) {
  const std::optional<std::string> file = databasePath();
  if (!file) return {};
  simulator::removeAbandonedHistories(*file);
  std::error_code ignored;
  if (std::filesystem::exists(*file, ignored)) return {};
  const auto plan = options.history(programme, SystemClock().now());
  if (!plan) return {};
  const auto made = simulator::writeHistory(*file, *plan, {}, [&quitting] { return quitting.isAsked(); });
  if (!made) return tl::unexpected(made.error());
  desktop::tell(fmt::format("a history of {} rows over {} days is in {}", made->rows, plan->days, *file));
  return {};
}

int run(QGuiApplication& application, const SimulatorOptions& options) {
  auto programme = options.programme();
  if (!programme) return fail(programme.error());
  for (const std::string& fault : programme->faults) desktop::tell(fault);
  if (const auto usable = simulator::prepareDocuments(options.documents); !usable) return fail(usable.error());
  if (const auto spared = simulator::spareDatabase(options.record, options.documents); !spared)
    return fail(spared.error());
  // From here on there is something to leave whole; before, a signal ends the program as usual.
  desktop::QuitOnSignal quitting;
  // The product has no tear-down: what is made here lives until the process ends.
  static auto* phone = new desktop::SimulatedDesktop(options.device, options.documents, options.console());
  const auto made = makeHistory(options, *programme, quitting);
  if (quitting.isAsked()) return EXIT_SUCCESS;
  if (!made) return fail(made.error());
  auto reader = desktop::awaitReader(options.record, quitting);
  if (quitting.isAsked()) return EXIT_SUCCESS;
  // Once more, as there may be a database now.
  if (const auto spared = simulator::spareDatabase(options.record, options.documents); !spared)
    return fail(spared.error());
  if (const auto ready = phone->tuneIn(*std::move(programme)); !ready) return fail(ready.error());
  reader = simulator::Descriptor();
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

  desktop::UnwatchedRun unwatched(*window, shell, *product->window()->rootViewController()->rootScreen(),
                                  options.screenshots);
  quitting.whenAsked([&unwatched] { unwatched.end(); });
  if (options.prints) unwatched.printChanges();
  desktop::QtQueue ending("end");
  if (options.seconds) {
    const std::chrono::duration<double> time(*options.seconds);
    ending.asyncAfter(std::chrono::duration_cast<Queue::Duration>(time), [&unwatched] { unwatched.end(); });
  }
  const int code = application.exec();
  lifecycle.terminate();
  const auto radio = phone->stopRadio();
  if (!radio.isAtRest) desktop::tell("the last rows are not stored: it takes too long");
  if (!radio.recording) desktop::tell(options.record.string() + ": " + radio.recording.error());
  return radio.isAtRest && radio.recording && !unwatched.hasFailed() ? code : EXIT_FAILURE;
}

}  // namespace

int main(int argc, char** argv) {
  fillStandardFiles();
  QCoreApplication::setApplicationName("quorl-simulator");
  const auto options = SimulatorOptions::parse(argc, argv);
  if (!options) {
    std::cout.flush();
    return std::cout ? options.error() : fail("standard output cannot be written");
  }
  std::shared_ptr<LogSink> shownLog;
  if (options->isVerbose)
    shownLog = std::make_shared<SpdlogSink>(log_category::kFallbackSubsystem,
                                            std::make_shared<spdlog::sinks::stderr_color_sink_mt>());
  const auto lostRows = std::make_shared<desktop::LostRows>(std::move(shownLog));
  installLogSink(lostRows);
  // Who reads what is printed or recorded may go; that is told where it is written.
  std::signal(SIGPIPE, SIG_IGN);
  int code = EXIT_FAILURE;
  {
    QGuiApplication application(argc, argv);
    readEnglishWithoutALanguage();
    code = run(application, *options);
  }
  if (lostRows->tellAll() && code == EXIT_SUCCESS) code = EXIT_FAILURE;
  // Threads of the product still live.
  std::cout.flush();
  std::_Exit(code);
}
