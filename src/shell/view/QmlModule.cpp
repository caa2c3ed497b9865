#include "shell/view/QmlModule.h"

#include <QFont>
#include <QGuiApplication>
#include <QQmlEngine>
#include <QQuickStyle>

// Made by Qt's tools; its mention keeps the linker from dropping the module's types.
extern void qml_register_types_Quorl();

namespace quorl::view {

void useQmlModule(QQmlEngine& engine) {
  [[maybe_unused]] static auto* volatile const keptTypes = &qml_register_types_Quorl;
  if (QQuickStyle::name().isEmpty()) QQuickStyle::setStyle("Basic");
  QFont font = QGuiApplication::font();
  font.setFamilies({"Inter", font.family()});
  QGuiApplication::setFont(font);
  engine.addImportPath("qrc:/qt/qml");
}

}  // namespace quorl::view
