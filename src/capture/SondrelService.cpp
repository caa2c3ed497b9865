#include "capture/SondrelService.h"

#include <string>
#include <utility>
#include <variant>

#include "platform/Platform.h"
#include "shell/Logs.h"
#include "shell/NotificationNames.h"

namespace quorl {
namespace {

/// All elements as `T`; nothing when there is no list or one of them is something else.
template <typename T>
std::optional<std::vector<T>> listOf(const std::optional<std::vector<SondrelObject>>& objects) {
  if (!objects) return std::nullopt;
  std::vector<T> list;
  list.reserve(objects->size());
  for (const SondrelObject& object : *objects) {
    const T* element = std::get_if<T>(&object);
    if (element == nullptr) return std::nullopt;
    list.push_back(*element);
  }
  return list;
}

}  // namespace

std::shared_ptr<SondrelService> SondrelService::make() {
  std::shared_ptr<SondrelService> service(new SondrelService);
  service->initialize();
  return service;
}

void SondrelService::initialize() {
  if (SondrelFactory* factory = Platform::current().sondrel) sondrel_ = factory->makeSondrel();
  if (sondrel_) sondrel_->setDelegate(weak_from_this());
  willTerminate_ = NotificationCenter::defaultCenter().observe(notification::kWillTerminate,
                                                               [this](const Notification&) { appWillTerminate(); });
}

void SondrelService::appWillTerminate() {
  sondrelLog.log("SondrelService - appwillTerminateNotification");
  if (!sondrel_) {
    sondrelLog.log("sondrel is not available");
    return;
  }
  sondrel_->stop();
}

void SondrelService::didStateChanged(std::int64_t state, const std::optional<SondrelError>& errorCode,
                                     const std::optional<SondrelConfiguration>& config) {
  const auto screen = delegate_.lock();
  switch (state) {
    case sondrel_state::kStopped:
      if (screen) sondrelLog.error("didStop");
      break;
    case sondrel_state::kStarted:
      if (screen && config && config->maxNumberOfLogs()) screen->setMaxNumberOfLogs(*config->maxNumberOfLogs());
      break;
    case sondrel_state::kError:
      if (!errorCode) break;
      sondrelLog.error("SondrelService - didStateChanged %{public}@", errorCode->text);
      presentAlert(*errorCode);
      break;
    default:
      sondrelLog.log("didStateChanged - state: unexpected");
  }
}

void SondrelService::didCollectLogs(const std::optional<std::vector<SondrelObject>>& logs,
                                    const std::optional<SondrelError>& errorCode) {
  if (const auto files = listOf<SondrelFileInformation>(logs)) {
    if (const auto screen = delegate_.lock()) screen->didReceiveLogs(*files);
  } else if (errorCode) {
    sondrelLog.error("SondrelService - didCollectLogs: %{public}@ ", errorCode->text);
    presentAlert(*errorCode);
  }
}

void SondrelService::configurationListAvailable(const std::optional<std::vector<SondrelObject>>& list) {
  const auto configurations = listOf<std::string>(list);
  if (!configurations) return;
  sondrelLog.log("configurationListAvailable");
  const auto screen = delegate_.lock();
  if (!screen) return;
  screen->setSondrelConfigurations(*configurations);
  screen->showConfigOption(*configurations);
}

void SondrelService::presentAlert(const SondrelError& error) {
  // The error's text is what the user should read first, so it is the title.
  if (const auto screen = delegate_.lock()) screen->present({error.text, "Error Occured", "Ok", {}});
}

}  // namespace quorl
