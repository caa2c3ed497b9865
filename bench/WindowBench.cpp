// The window of the touch program, offscreen and drawn in software: start to first frame, frames while 200 rows a
// second arrive with the list on show, and memory in the long run. Beside each stands the same of a window without the
// product, or without rows.
//
//   bench_window                            start and frames, about half a minute
//   bench_window --memory SECONDS SPEED     memory on a way through the default scenario, such as 360 10

#include <QEventLoop>
#include <QGuiApplication>
#include <QQmlApplicationEngine>
#include <QQuickWindow>
#include <QTimer>
#include <algorithm>
#include <chrono>
#include <cstddef>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <functional>
#include <memory>
#include <string>
#include <string_view>
#include <vector>

#include "Memory.h"
#include "app/AppDelegate.h"
#include "app/ApplicationLoop.h"
#include "base/NotificationCenter.h"
#include "hosts/desktop/SimulatedDesktop.h"
#include "hosts/desktop/SimulatorOptions.h"
#include "shell/NotificationNames.h"
#include "shell/view/QmlModule.h"
#include "shell/view/ShellBinding.h"
#include "support/TemporaryDirectory.h"
#include "support/window/WindowFixture.h"

namespace {

using namespace quorl;
using namespace std::chrono_literals;
using Clock = std::chrono::steady_clock;
using Milliseconds = std::chrono::duration<double, std::milli>;

constexpr char kEmptyWindow[] =
    "import QtQuick.Controls.Basic\nApplicationWindow { width: 390; height: 844; visible: true }";
constexpr double kRowsPerSecond = 200;
constexpr auto kFrame = 16ms;

void spin(std::chrono::milliseconds time) {
  QEventLoop loop;
  QTimer::singleShot(time, &loop, &QEventLoop::quit);
  loop.exec();
}

void untilFirstFrame(QQuickWindow& window) {
  QEventLoop loop;
  QObject::connect(&window, &QQuickWindow::frameSwapped, &loop, &QEventLoop::quit);
  loop.exec();
}

double mebibytes() {
  return static_cast<double>(bench::memory()) / 1024 / 1024;
}

double percentile(std::vector<double> values, double part) {
  if (values.empty()) return 0;
  std::sort(values.begin(), values.end());
  return values[static_cast<std::size_t>(part * static_cast<double>(values.size() - 1))];
}

QQuickWindow& windowOf(QQmlApplicationEngine& engine) {
  auto* window = qobject_cast<QQuickWindow*>(engine.rootObjects().value(0));
  if (window == nullptr) std::abort();
  return *window;
}

/// The product behind its window. The product has no tear-down: there is one, and it stays.
class Program {
 public:
  /// Without a recording it goes through a scenario.
  Program(const std::filesystem::path& documents, const std::filesystem::path& recording, double speed) {
    desktop::SimulatorOptions options;
    options.device.chipset = "mav20";
    options.device.isInternalBuild = true;
    options.speed = speed;
    options.recording = recording;
    auto programme = options.programme();
    if (!programme) std::abort();
    events_ = programme->events;
    phone_ = new desktop::SimulatedDesktop(options.device, documents);
    if (!phone_->tuneIn(*std::move(programme))) std::abort();
    product_ = new AppDelegate;
    ApplicationLoop(*product_).launch();
    shell_ = new view::ShellBinding(*product_->window(), phone_->alerts());
    engine_ = new QQmlApplicationEngine;
    view::useQmlModule(*engine_);
    engine_->setInitialProperties({{"shell", QVariant::fromValue(shell_)}});
    engine_->load(QUrl(view::kAppWindowUrl));
    rows_ = NotificationCenter::defaultCenter().observe(notification::kNewZelkorMetric,
                                                        [this](const Notification&) { ++numberOfRows_; });
  }

  QQuickWindow& window() { return windowOf(*engine_); }
  desktop::SimulatedDesktop& phone() { return *phone_; }
  void showList() {
    shell_->menuBar()->press(1);
    spin(1500ms);
  }
  /// Delivers events until as many rows have come as are due by now.
  void deliverRows(double due) {
    // The rows of an event come later; a few events at a time keep the rate near.
    for (int count = 0; static_cast<double>(numberOfRows_) < due && count < 8; ++count)
      phone_->deliver(events_[next_++ % events_.size()]);
  }
  std::size_t numberOfRows() const { return numberOfRows_; }

 private:
  std::vector<simulator::RecordedEvent> events_;
  std::size_t next_ = 0;
  std::size_t numberOfRows_ = 0;
  desktop::SimulatedDesktop* phone_ = nullptr;
  AppDelegate* product_ = nullptr;
  view::ShellBinding* shell_ = nullptr;
  QQmlApplicationEngine* engine_ = nullptr;
  NotificationCenter::Observation rows_;
};

struct Frames {
  std::vector<double> drawing;  // ms of each frame
  std::vector<double> waiting;  // ms that the main thread let a 16 ms timer wait
};

/// Frames of a window that draws as often as it may. `tick` runs before each with the seconds since the start.
Frames framesOf(QQuickWindow& window, std::chrono::milliseconds time, const std::function<void(double)>& tick) {
  Frames frames;
  Clock::time_point begin;
  QObject context;
  QObject::connect(&window, &QQuickWindow::beforeSynchronizing, &context, [&] { begin = Clock::now(); });
  QObject::connect(&window, &QQuickWindow::frameSwapped, &context,
                   [&] { frames.drawing.push_back(Milliseconds(Clock::now() - begin).count()); });
  const auto start = Clock::now();
  auto due = start + kFrame;
  QTimer timer;
  timer.setTimerType(Qt::PreciseTimer);
  QObject::connect(&timer, &QTimer::timeout, &context, [&] {
    const auto now = Clock::now();
    frames.waiting.push_back(std::max(0.0, Milliseconds(now - due).count()));
    due = now + kFrame;
    tick(std::chrono::duration<double>(now - start).count());
    window.update();
  });
  timer.start(kFrame);
  spin(time);
  return frames;
}

void print(const char* what, const Frames& frames) {
  std::printf(
      "%-44s %5zu frames, drawn in %5.2f ms (99 of 100 in %5.2f), main thread late %5.2f ms (99 of 100 %5.2f)\n", what,
      frames.drawing.size(), percentile(frames.drawing, 0.5), percentile(frames.drawing, 0.99),
      percentile(frames.waiting, 0.5), percentile(frames.waiting, 0.99));
}

void startAndFrames(const std::filesystem::path& documents, std::chrono::milliseconds time) {
  auto begin = Clock::now();
  double baselineMemory = 0;
  {
    QQmlApplicationEngine engine;
    view::useQmlModule(engine);
    engine.loadData(kEmptyWindow);
    untilFirstFrame(windowOf(engine));
    std::printf("%-44s %7.1f ms\n", "start to first frame, empty window", Milliseconds(Clock::now() - begin).count());
    baselineMemory = mebibytes();
  }
  begin = Clock::now();
  Program program(documents, QUORL_SOURCE_DIR "/resources/recordings/mav.jsonl", 1);
  untilFirstFrame(program.window());
  std::printf("%-44s %7.1f ms\n", "start to first frame, product", Milliseconds(Clock::now() - begin).count());
  std::printf("%-44s %7.1f MiB (empty window %.1f)\n", "memory at first frame", mebibytes(), baselineMemory);
  program.showList();
  print("list on show, no rows", framesOf(program.window(), time, [](double) {}));
  const std::size_t before = program.numberOfRows();
  const Frames busy = framesOf(program.window(), time, [&](double seconds) {
    program.deliverRows(static_cast<double>(before) + kRowsPerSecond * seconds);
  });
  print("list on show, rows arriving", busy);
  std::printf("%-44s %7.1f rows/s\n", "rate",
              static_cast<double>(program.numberOfRows() - before) / std::chrono::duration<double>(time).count());
}

void memoryInTheLongRun(const std::filesystem::path& documents, std::chrono::seconds time, double speed) {
  Program program(documents, {}, speed);
  untilFirstFrame(program.window());
  program.showList();
  program.phone().startRadio();
  const auto step = std::max(time / 12, std::chrono::seconds(1));
  for (auto passed = 0s; passed <= time; passed += step) {
    std::printf("%4ld s, simulated %5.0f s: %7zu rows, %7.1f MiB\n", static_cast<long>(passed.count()),
                static_cast<double>(passed.count()) * speed, program.numberOfRows(), mebibytes());
    std::fflush(stdout);
    spin(step);
  }
}

}  // namespace

int main(int argc, char** argv) {
  const bool isSmoke = argc > 1 && std::string_view(argv[1]).starts_with("--benchmark_min_time");
  const auto application = test::makeOffscreenApplication(argc, argv);
  auto documents = std::make_unique<test::TemporaryDirectory>();
  if (argc == 4 && std::string_view(argv[1]) == "--memory")
    memoryInTheLongRun(documents->path(), std::chrono::seconds(std::atoi(argv[2])), std::atof(argv[3]));
  else
    startAndFrames(documents->path(), isSmoke ? 200ms : 10s);
  documents.reset();
  std::fflush(stdout);
  std::_Exit(EXIT_SUCCESS);
}
