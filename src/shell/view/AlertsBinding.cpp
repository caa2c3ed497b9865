#include "shell/view/AlertsBinding.h"

#include <utility>

#include "shell/view/QtText.h"

namespace quorl::view {

void AlertsBinding::present(Alert alert) {
  alerts_.push_back(std::move(alert));
  emit changed();
}

QString AlertsBinding::title() const {
  return alerts_.empty() ? QString() : toQt(alerts_.front().title);
}

QString AlertsBinding::message() const {
  return alerts_.empty() ? QString() : toQt(alerts_.front().message);
}

QString AlertsBinding::button() const {
  return alerts_.empty() ? QString() : toQt(alerts_.front().button);
}

void AlertsBinding::press() {
  if (alerts_.empty()) return;
  const Alert pressed = std::move(alerts_.front());
  alerts_.pop_front();
  emit changed();
  if (pressed.onPress) pressed.onPress();
}

}  // namespace quorl::view
