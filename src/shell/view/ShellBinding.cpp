#include "shell/view/ShellBinding.h"

namespace quorl::view {

ShellBinding::ShellBinding(Window& window, QObject* parent) : QObject(parent), window_(window) {}

}  // namespace quorl::view
