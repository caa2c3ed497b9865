#include "screens/dashboard/view/ManageDashboardBinding.h"

#include <utility>
#include <vector>

#include "platform/Platform.h"
#include "screens/dashboard/DashboardViewController.h"
#include "screens/metricdetail/MetricSections.h"
#include "shell/view/QtText.h"

namespace quorl::view {
namespace {

/// As the dashboard names it.
std::string nameOf(const DashboardTableItem& item) {
  DashboardViewModelObject object;
  object.attributeName = Platform::current().strings.localized(item.attributeName);
  object.section = sectionNumberOf(item.attributeName);
  return dashboardNameText(object);
}

}  // namespace

std::string ManagedRow::key() const {
  return item.metricTech + '\n' + item.metricName + '\n' + item.attributeName;
}

QList<int> ManagedRow::changedRoles(const ManagedRow& /*next*/) const {
  return {};  // all that is shown is part of the key
}

QVariant ManageDashboardListModel::data(const QModelIndex& index, int role) const {
  const ManagedRow* managed = row(index);
  if (managed == nullptr) return {};
  switch (role) {
    case Qt::DisplayRole:
    case NameRole:
      return toQt(nameOf(managed->item));
    case ContextRole:
      return toQt(managed->item.metricTech + " · " + managed->item.metricName);
    default:
      return {};
  }
}

QHash<int, QByteArray> ManageDashboardListModel::roleNames() const {
  return {{NameRole, "name"}, {ContextRole, "context"}};
}

ManageDashboardBinding::ManageDashboardBinding(std::shared_ptr<ManageDashboardViewController> controller,
                                               QObject* parent)
    : QObject(parent),
      controller_(std::move(controller)),
      rowConnection_(controller_->onRowRemoved([this](std::size_t) { takeRows(); })),
      dismissConnection_(controller_->onDismiss([this] { emit dismissed(); })) {
  takeRows();
}

void ManageDashboardBinding::takeRows() {
  std::vector<ManagedRow> rows;
  rows.reserve(controller_->dashboardList().size());
  for (const DashboardTableItem& item : controller_->dashboardList()) rows.push_back({item});
  rows_.setRows(std::move(rows));
}

QString ManageDashboardBinding::hint() const {
  return toQt(ManageDashboardViewController::hint);
}

void ManageDashboardBinding::swipeToDelete(int index) {
  if (controller_ && index >= 0) controller_->swipeToDelete(static_cast<std::size_t>(index));
}

void ManageDashboardBinding::dismiss() {
  if (controller_) controller_->dismiss();
}

void ManageDashboardBinding::leave() {
  rowConnection_.disconnect();
  dismissConnection_.disconnect();
  controller_.reset();
  deleteLater();
}

}  // namespace quorl::view
