#pragma once

class QQmlEngine;

namespace quorl::view {

/// Where the window's root stands: pass it to `QQmlApplicationEngine::load`.
inline constexpr char kAppWindowUrl[] = "qrc:/qt/qml/Quorl/AppWindow.qml";

/// Makes `import Quorl` work in `engine`, and chooses the controls' style and the application's font. To be called
/// before the first QML file is loaded.
void useQmlModule(QQmlEngine& engine);

}  // namespace quorl::view
