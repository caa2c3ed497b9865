#include "hosts/desktop/UnwatchedRun.h"

#include <QCoreApplication>
#include <QEvent>
#include <QImage>
#include <QQuickWindow>
#include <QSaveFile>
#include <chrono>
#include <iostream>
#include <system_error>
#include <utility>

#include <fmt/format.h>

#include "base/PrintableText.h"
#include "hosts/desktop/Tell.h"
#include "shell/BaseViewController.h"
#include "shell/view/QtText.h"
#include "shell/view/ShellBinding.h"

namespace quorl::desktop {
namespace {

using namespace std::chrono_literals;

/// How often it is looked whether something has changed.
constexpr auto kLook = 1s;
/// From the press of a tab until its screen stands still.
constexpr auto kTabTime = 1500ms;

std::string dashboardText(DashboardViewController& dashboard) {
  std::string text = printable(dashboard.lastRefreshedText()) + "\n";
  for (const DashboardViewModelObject& row : dashboard.viewModel()->metrics())
    text += fmt::format("  {:<40} {:>24}\n", printable(dashboardNameText(row)), printable(dashboardValueText(row)));
  return text;
}

std::string listText(AllMetricsViewController& list) {
  std::string text;
  for (const AllMetricsDataSource& group : list.table()) {
    text += printable(group.metricTech) + "\n";
    for (const AllMetricsRowItem& row : group.rowItems)
      text += fmt::format("  {:<40} {:>24}\n", printable(AllMetricsViewController::nameText(row)),
                          printable(AllMetricsViewController::timeText(row)));
  }
  return text;
}

}  // namespace

UnwatchedRun::UnwatchedRun(QQuickWindow& window, view::ShellBinding& shell, BaseViewController& base,
                           std::filesystem::path pictures)
    : window_(window), shell_(shell), base_(base), folder_(std::move(pictures)) {
  window_.installEventFilter(this);
  QObject::connect(&printing_, &QTimer::timeout, this, [this] { print(); });
}

void UnwatchedRun::printChanges() {
  printing_.start(kLook);
  print();
}

void UnwatchedRun::print() {
  std::string text = "Dashboard  " + dashboardText(*base_.dashboardViewController()) + "All Metrics\n" +
                     listText(*base_.firstLevelViewController());
  if (text == printed_) return;
  printed_ = std::move(text);
  std::cout << printed_ << std::endl;
  if (std::cout) return;
  // Whoever read it has gone, as a rule: what ends a pipe's other programs at once ends this one whole.
  printing_.stop();
  fail("standard output cannot be written");
  end();
}

void UnwatchedRun::fail(const std::string& text) {
  hasFailed_ = true;
  tell(text);
}

void UnwatchedRun::end() {
  if (isEnding_) return;
  isEnding_ = true;
  std::error_code error;
  if (!folder_.empty()) std::filesystem::create_directories(folder_, error);
  if (error) fail(folder_.string() + ": " + error.message());
  if (!folder_.empty() && !error) return takePicture();
  // The event loop may not run yet.
  QMetaObject::invokeMethod(QCoreApplication::instance(), &QCoreApplication::quit, Qt::QueuedConnection);
}

bool UnwatchedRun::eventFilter(QObject* object, QEvent* event) {
  // A closed window shows nothing to take pictures of. Closed once more, it is left at that.
  if (object != &window_ || event->type() != QEvent::Close || folder_.empty() || isEnding_)
    return QObject::eventFilter(object, event);
  event->ignore();
  end();
  return true;
}

void UnwatchedRun::takePicture() {
  if (nextPicture_ == shell_.menuBar()->count()) {
    QCoreApplication::quit();
    return;
  }
  shell_.menuBar()->press(nextPicture_);
  QTimer::singleShot(kTabTime, this, [this] {
    savePicture(folder_ / (view::fromQt(shell_.screenNames().at(nextPicture_)) + ".png"));
    ++nextPicture_;
    takePicture();
  });
}

void UnwatchedRun::savePicture(const std::filesystem::path& file) {
  QSaveFile output(view::toQt(file.string()));
  if (output.open(QIODevice::WriteOnly) && window_.grabWindow().save(&output, "PNG") && output.commit()) return;
  fail(file.string() + ": " + view::fromQt(output.errorString()));
}

}  // namespace quorl::desktop
