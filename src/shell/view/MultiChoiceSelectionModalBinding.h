#pragma once

#include <QObject>
#include <QStringList>
#include <memory>

#include <QtQml/qqmlregistration.h>

#include "base/Signal.h"
#include "shell/MultiChoiceSelectionModal.h"

namespace quorl::view {

/// A choice modal for QML. Main thread.
class MultiChoiceSelectionModalBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by its screen")
  Q_PROPERTY(QStringList names READ names CONSTANT)

 public:
  explicit MultiChoiceSelectionModalBinding(std::shared_ptr<MultiChoiceSelectionModal> modal,
                                            QObject* parent = nullptr);

  QStringList names() const;
  Q_INVOKABLE void selectRow(int index);
  Q_INVOKABLE void dismiss();

 signals:
  /// The modal is to be closed.
  void dismissed();

 private:
  const std::shared_ptr<MultiChoiceSelectionModal> modal_;
  const Connection dismissal_;
};

}  // namespace quorl::view
