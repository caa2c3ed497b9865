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

/// Stands in for the user of a window that nobody sees: prints what dashboard and list show, and takes pictures of the
/// tabs. Main thread.
class UnwatchedRun final : public QObject {
 public:
  UnwatchedRun(QQuickWindow& window, view::ShellBinding& shell, BaseViewController& base);

  /// Prints the dashboard and the list now, and again whenever what they show has changed.
  void printChanges();
  /// Goes through the tabs, writes a picture of each into `folder`, and ends the program. A picture that cannot be
  /// written is told on standard error.
  void takePictures(const std::filesystem::path& folder);

 private:
  void print();
  void takePicture();

  QQuickWindow& window_;
  view::ShellBinding& shell_;
  BaseViewController& base_;
  QTimer printing_;
  std::string printed_;
  std::filesystem::path folder_;
  int nextPicture_ = 0;
};

}  // namespace quorl::desktop
