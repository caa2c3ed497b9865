// Writes a picture of every screen, light and dark, on a phone and on a tablet, into a folder. The phone is a fake one
// in virtual time that has heard the shipped recording for some days, so the same pictures come out every time.

#include <QGuiApplication>
#include <chrono>
#include <filesystem>
#include <iostream>
#include <memory>
#include <stdexcept>
#include <string>
#include <vector>

#include <fmt/format.h>

#include "hosts/simulator/PhoneServices.h"
#include "hosts/simulator/Recording.h"
#include "hosts/simulator/SondrelSimulator.h"
#include "hosts/simulator/TelephonyScript.h"
#include "hosts/simulator/TimeShift.h"
#include "shell/view/Appearance.h"
#include "support/TimeZoneAndLocale.h"
#include "support/VirtualTimeVfs.h"
#include "support/window/WindowFixture.h"

namespace quorl::test {
namespace {

using namespace std::chrono_literals;

const std::filesystem::path kResources = std::filesystem::path(QUORL_SOURCE_DIR) / "resources";

struct Look {
  const char* name;
  QSize size;
  bool isDark;
};

/// The time of a phone that is yet to be made: the database's file system has to be there before and after it.
struct PhoneClock final : Clock {
  Date now() const override { return clock->now(); }
  const Clock* clock = nullptr;
};

class Photographer : public WindowPhone {
 public:
  Photographer(std::filesystem::path folder, Look look, const std::vector<simulator::RecordedEvent>& events)
      : folder_(std::move(folder)), look_(look), events_(events) {
    view::Appearance::shared().setDark(look.isDark);
    setSize(look.size.width(), look.size.height());
    phone.strings.rest = &strings_;
    isInternalBuild();
    hasLogCapture();
    simulator::SondrelSimulator::Options capture;
    capture.folder = phone.directory.path() / "Sondrel";
    library_ = std::make_unique<simulator::SondrelSimulator>(capture, *phone.mainQueue, phone.time, phone.time);
    Platform::current().sondrel = library_.get();
    const auto script = simulator::readTelephonyScript(kResources / "telephony" / "two-sims.jsonl");
    for (const simulator::TelephonyScriptStep& step : script.steps)
      if (step.at < 12s) telephony.perform(step.event);
  }

  void photographAll() {
    launch();
    hearForDays();
    pass(16s);
    picture("dashboard");
    tap("manageButton");
    pass(500ms);
    picture("managing");
    key(Qt::Key_Escape);
    pass(500ms);
    select(1);
    picture("metrics");
    openMetric("Rach Attempt");
    picture("detail");
    key(Qt::Key_Escape);
    pass(500ms);
    openMetric("Nr ConnectionStats");
    openGraph();
    picture("history");
    key(Qt::Key_Escape);
    pass(500ms);
    key(Qt::Key_Escape);
    pass(500ms);
    tap("exportButton");
    pass(500ms);
    picture("export");
    key(Qt::Key_Escape);
    pass(500ms);
    select(2);
    tap("startButton");
    pass(5s);
    picture("capture");
    tap("configButton");
    pass(1s);
    picture("capture-choice");
  }
  void photographUnknownChipset() {
    phone.properties.texts.erase("BasebandChipset");
    launch();
    pass(1s);
    picture("unknown-baseband");
  }

 private:
  void tap(const QString& name) {
    if (!isShown(name)) throw std::runtime_error(fmt::format("{} is not shown", name.toStdString()));
    WindowPhone::tap(name);
  }
  void select(int tab) {
    tap("menuCell" + QString::number(tab));
    pass(1s);
  }
  /// Opens the history of the first attribute that has one.
  void openGraph() {
    grab();  // lays the rows out
    tap("graphButton");
    pass(500ms);
  }
  /// Scrolls to a row of the metric list and opens it.
  void openMetric(const QString& name) {
    QQuickItem* list = find("metricsList");
    for (double scrolled = 0; scrolled < list->property("contentHeight").toDouble(); scrolled += list->height() / 2) {
      list->setProperty("contentY", scrolled);
      settle();
      for (QQuickItem* row : findAll("metricRow")) {
        if (row->property("name") != name) continue;
        QMetaObject::invokeMethod(row, "clicked");
        pass(1s);
        return;
      }
    }
    throw std::runtime_error(fmt::format("{} is not in the list", name.toStdString()));
  }
  /// The recording, twice a day for some days.
  void hearForDays() {
    const Date now = phone.time.now();
    for (int halfDays = 7; halfDays >= 0; --halfDays) {
      const Date begin = now - halfDays * 12h - 11min;
      for (const simulator::RecordedEvent& event : events_) {
        phone.time.setNow(begin + std::chrono::milliseconds(event.atMs.value_or(0)));
        std::vector<simulator::RecordedEvent> heard = {event};
        simulator::shiftToNow(heard, phone.time.now());
        phone.zelkor.deliver(zelkor::kEventMetric, heard.front().message());
      }
      phone.time.settle();
    }
    phone.time.setNow(now);
  }
  void picture(const std::string& name) {
    const auto file = folder_ / fmt::format("{}-{}-{}.png", name, look_.name, look_.isDark ? "dark" : "light");
    const QImage shown = grab();
    if (!shown.save(QString::fromStdString(file.string())))
      throw std::runtime_error(fmt::format("{} could not be written", file.string()));
    if (shown != drawnAnew()) throw std::runtime_error(fmt::format("{} has traces of earlier frames", file.string()));
    for (const std::string& warning : takeWarnings()) std::cerr << name << ": " << warning << '\n';
  }

  simulator::GettextStrings strings_{{std::filesystem::path(QUORL_BINARY_DIR) / "share" / "quorl"}};
  std::unique_ptr<simulator::SondrelSimulator> library_;
  const std::filesystem::path folder_;
  const Look look_;
  const std::vector<simulator::RecordedEvent>& events_;
};

void photographOn(const std::filesystem::path& folder, const Look& look,
                  const std::vector<simulator::RecordedEvent>& events, void (Photographer::*photograph)()) {
  PhoneClock clock;
  const VirtualTimeVfs files(clock);
  Photographer photographer(folder, look, events);
  clock.clock = &photographer.phone.time;
  (photographer.*photograph)();
}

int photograph(const std::filesystem::path& folder) {
  std::filesystem::create_directories(folder);
  const ScopedTimeZone zone("UTC");
  const ScopedLocale locale("en_US");
  const ScopedLanguage language("en");
  const auto recording = simulator::readRecording(kResources / "recordings" / "mav.jsonl");
  if (!recording) throw std::runtime_error(recording.error());
  for (const bool isDark : {false, true}) {
    for (const Look look : {Look{"phone", {390, 844}, isDark}, Look{"tablet", {1024, 768}, isDark}})
      photographOn(folder, look, recording->events, &Photographer::photographAll);
    photographOn(folder, {"phone", {390, 844}, isDark}, recording->events, &Photographer::photographUnknownChipset);
  }
  return EXIT_SUCCESS;
}

}  // namespace
}  // namespace quorl::test

int main(int argc, char** argv) {
  if (argc != 2) {
    std::cerr << "usage: quorl-screenshots FOLDER\n";
    return EXIT_FAILURE;
  }
  const std::filesystem::path folder = argv[1];
  try {
    const auto application = quorl::test::makeOffscreenApplication(argc, argv);
    return quorl::test::photograph(folder);
  } catch (const std::exception& error) {
    std::cerr << "quorl-screenshots: " << error.what() << '\n';
    return EXIT_FAILURE;
  }
}
