#include "shell/view/ShellBinding.h"

#include <utility>

#include "capture/view/SondrelBinding.h"
#include "screens/dashboard/view/DashboardBinding.h"
#include "screens/export/view/ExportBinding.h"
#include "screens/metriclist/view/AllMetricsBinding.h"
#include "shell/BaseViewController.h"
#include "shell/LargeTitle.h"
#include "shell/Window.h"
#include "shell/view/QtText.h"

namespace quorl::view {
namespace {

BaseViewController& displayed(Window& window) {
  BaseViewController& base = *window.rootViewController()->rootScreen();
  base.viewDidLoad();
  return base;
}

}  // namespace

ShellBinding::ShellBinding(Window& window, AlertsBinding& alerts, QObject* parent)
    : QObject(parent),
      base_(displayed(window)),
      alerts_(alerts),
      menuBar_(base_.menuBar()),
      carrierBar_(*base_.carrierBar()),
      screens_(static_cast<std::size_t>(menuBar_.count())),
      changes_(base_.onChange([this] { emit changed(); })),
      exports_(base_.onPresentExport([this](std::shared_ptr<ExportViewController> screen) {
        emit presentExport(new ExportBinding(std::move(screen), this));
      })) {}

ShellBinding::~ShellBinding() = default;

double ShellBinding::carrierBarHeight() const {
  return BaseViewController::kCarrierBarHeight;
}

QStringList ShellBinding::screenNames() const {
  const QStringList names = {"DashboardViewController", "AllMetricsViewController", "SondrelViewController"};
  return names.first(menuBar_.count());
}

int ShellBinding::listIndex() const {
  return BaseViewController::allMetricsIndex;
}

QString ShellBinding::title() const {
  return toQt(base_.title());
}

bool ShellBinding::prefersLargeTitles() const {
  return base_.prefersLargeTitles();
}

bool ShellBinding::showsExportButton() const {
  return base_.hasExportButton() && !base_.isExportButtonHidden();
}

int ShellBinding::currentIndex() const {
  return static_cast<int>(base_.currentlySelectedIndex());
}

QObject* ShellBinding::screen(int index) {
  if (index < 0 || index >= menuBar_.count()) return nullptr;
  QObject*& screen = screens_[static_cast<std::size_t>(index)];
  if (screen == nullptr) screen = makeScreen(index);
  return screen;
}

QObject* ShellBinding::makeScreen(int index) {
  switch (index) {
    case BaseViewController::dashobardIndex:
      return new DashboardBinding(base_.dashboardViewController(), this);
    case BaseViewController::allMetricsIndex:
      return new AllMetricsBinding(base_.firstLevelViewController(), this);
    case BaseViewController::sondrelIndex:
      return new SondrelBinding(base_.sondrelViewController(), this);
    default:
      return nullptr;
  }
}

void ShellBinding::exportTapped() {
  base_.exportTappedWithTapGestureRecognizer();
}

void ShellBinding::rootWillAppear() {
  base_.viewWillAppear();
}

bool ShellBinding::isLargeTitleCollapsed(bool isCollapsed, double scrolled, double contentHeight, double viewHeight,
                                         double titleHeight) {
  return quorl::isLargeTitleCollapsed(isCollapsed, {scrolled, contentHeight, viewHeight}, titleHeight);
}

}  // namespace quorl::view
