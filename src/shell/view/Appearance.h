#pragma once

#include <QObject>

#include <QtQml/qqmlregistration.h>

class QJSEngine;
class QQmlEngine;

namespace quorl::view {

/// How the system wants windows to look. A host keeps it true; `Theme` makes colours and sizes of it. Main thread.
class Appearance final : public QObject {
  Q_OBJECT
  QML_ELEMENT
  QML_SINGLETON
  Q_PROPERTY(bool isDark READ isDark WRITE setDark NOTIFY changed)
  Q_PROPERTY(double fontScale READ fontScale WRITE setFontScale NOTIFY changed)
  Q_PROPERTY(bool reducedMotion READ reducedMotion WRITE setReducedMotion NOTIFY changed)

 public:
  static constexpr double kSmallestFontScale = 0.8;
  static constexpr double kLargestFontScale = 2.0;

  /// The one instance of the process, shared by all engines and owned by none.
  static Appearance& shared();
  /// How an engine gets at it.
  static Appearance* create(QQmlEngine* engine, QJSEngine* scriptEngine);

  bool isDark() const { return isDark_; }
  void setDark(bool isDark);
  /// Factor of all type sizes, 0.8 to 2.
  double fontScale() const { return fontScale_; }
  /// Takes the nearest factor in range.
  void setFontScale(double fontScale);
  bool reducedMotion() const { return reducedMotion_; }
  void setReducedMotion(bool reducedMotion);

 signals:
  void changed();

 private:
  Appearance() = default;

  bool isDark_ = false;
  double fontScale_ = 1;
  bool reducedMotion_ = false;
};

}  // namespace quorl::view
