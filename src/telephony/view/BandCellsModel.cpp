#include "telephony/view/BandCellsModel.h"

#include "shell/view/QtText.h"

namespace quorl::view {

QString BandCellsModel::sectionTitle() const {
  return toQt(screen_.sectionTitle());
}

int BandCellsModel::rowCount(const QModelIndex& parent) const {
  return parent.isValid() ? 0 : static_cast<int>(screen_.numberOfCells());
}

QVariant BandCellsModel::data(const QModelIndex& index, int role) const {
  if (!checkIndex(index, CheckIndexOption::IndexIsValid | CheckIndexOption::ParentIsInvalid)) return {};
  const HorvaneMetricDetails::Cell cell = screen_.cellAt(static_cast<std::size_t>(index.row()));
  switch (role) {
    case MainTextRole:
      return toQt(cell.mainText);
    case SecondTextRole:
      return toQt(cell.secondText);
    case IsSecondTextHiddenRole:
      return cell.isSecondTextHidden();
    default:
      return {};
  }
}

QHash<int, QByteArray> BandCellsModel::roleNames() const {
  return {{MainTextRole, "mainText"}, {SecondTextRole, "secondText"}, {IsSecondTextHiddenRole, "isSecondTextHidden"}};
}

}  // namespace quorl::view
