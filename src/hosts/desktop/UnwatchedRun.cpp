#include "hosts/desktop/UnwatchedRun.h"

#include <QCoreApplication>
#include <QImage>
#include <QQuickWindow>
#include <chrono>
#include <iostream>

#include <fmt/format.h>

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
  std::string text = dashboard.lastRefreshedText() + "\n";
  for (const DashboardViewModelObject& row : dashboard.viewModel()->metrics())
    text += fmt::format("  {:<40} {:>24}\n", dashboardNameText(row), dashboardValueText(row));
  return text;
}

std::string listText(AllMetricsViewController& list) {
  std::string text;
  for (const AllMetricsDataSource& group : list.table()) {
    text += group.metricTech + "\n";
    for (const AllMetricsRowItem& row : group.rowItems)
      text += fmt::format("  {:<40} {:>24}\n", AllMetricsViewController::nameText(row),
                          AllMetricsViewController::timeText(row));
  }
  return text;
}

}  // namespace

UnwatchedRun::UnwatchedRun(QQuickWindow& window, view::ShellBinding& shell, BaseViewController& base)
    : window_(window), shell_(shell), base_(base) {
  QObject::connect(&printing_, &QTimer::timeout, this, [this] { print(); });
}

void UnwatchedRun::printChanges() {
  print();
  printing_.start(kLook);
}

void UnwatchedRun::print() {
  std::string text = "Dashboard  " + dashboardText(*base_.dashboardViewController()) + "All Metrics\n" +
                     listText(*base_.firstLevelViewController());
  if (text == printed_) return;
  printed_ = std::move(text);
  std::cout << printed_ << std::endl;
}

void UnwatchedRun::takePictures(const std::filesystem::path& folder) {
  folder_ = folder;
  std::error_code error;
  std::filesystem::create_directories(folder_, error);
  takePicture();
}

void UnwatchedRun::takePicture() {
  if (nextPicture_ == shell_.menuBar()->count()) {
    QCoreApplication::quit();
    return;
  }
  shell_.menuBar()->press(nextPicture_);
  QTimer::singleShot(kTabTime, this, [this] {
    const QString file =
        view::toQt((folder_ / (view::fromQt(shell_.screenNames().at(nextPicture_)) + ".png")).string());
    if (!window_.grabWindow().save(file)) std::cerr << view::fromQt(file) << " could not be written\n";
    ++nextPicture_;
    takePicture();
  });
}

}  // namespace quorl::desktop
