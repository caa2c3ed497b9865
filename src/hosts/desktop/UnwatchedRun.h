#pragma once

#include <QObject>
#include <QTimer>
#include <filesystem>
#include <string>

class QQuickWindow;

namespace quorl {
class BaseViewController;
}
namespace quorl::view {
class ShellBinding;
}

namespace quorl::desktop {

/// Stands in for the user of a window that nobody sees: prints what dashboard and list show, takes pictures of the
/// tabs, and ends the program. Main thread.
class UnwatchedRun final : public QObject {
 public:
  /// `pictures` is a folder for pictures of the tabs, made if it is missing; empty for none.
  UnwatchedRun(QQuickWindow& window, view::ShellBinding& shell, BaseViewController& base,
               std::filesystem::path pictures);

  /// Prints the dashboard and the list now, and again whenever what they show has changed. Ends the program when it
  /// cannot print.
  void printChanges();
  /// Ends the program, behind the pictures if there are to be any. Closing the window comes to the same.
  void end();
  /// Whether something could not be printed, or a picture not be written. The user has been told.
  bool hasFailed() const { return hasFailed_; }

  bool eventFilter(QObject* object, QEvent* event) override;

 private:
  void print();
  void takePicture();
  void savePicture(const std::filesystem::path& file);
  void fail(const std::string& text);

  QQuickWindow& window_;
  view::ShellBinding& shell_;
  BaseViewController& base_;
  QTimer printing_;
  std::string printed_;
  const std::filesystem::path folder_;
  int nextPicture_ = 0;
  bool isEnding_ = false;
  bool hasFailed_ = false;
};

}  // namespace quorl::desktop
