#pragma once

#include <QObject>

#include <QtQml/qqmlregistration.h>

namespace quorl {
class Window;
}

namespace quorl::view {

/// The window's root object for QML. Refers to the product's window, which outlives it. Main thread.
class ShellBinding final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_UNCREATABLE("made by the host")

 public:
  explicit ShellBinding(Window& window, QObject* parent = nullptr);

 private:
  Window& window_;
};

}  // namespace quorl::view
