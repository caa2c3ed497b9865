#include "hosts/desktop/QtPasteboard.h"

#include <QClipboard>
#include <QGuiApplication>

#include "shell/view/QtText.h"

namespace quorl::desktop {

void QtPasteboard::setText(std::string_view text) {
  QGuiApplication::clipboard()->setText(view::toQt(text));
}

}  // namespace quorl::desktop
