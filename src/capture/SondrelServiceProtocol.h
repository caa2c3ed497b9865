#pragma once

#include <string>
#include <vector>

#include "platform/Services.h"
#include "platform/SondrelLibrary.h"

namespace quorl {

/// The screen as the capture service sees it. Main thread.
class SondrelServiceProtocol {
 public:
  virtual ~SondrelServiceProtocol() = default;
  virtual void didReceiveLogs(const std::vector<SondrelFileInformation>& batch) = 0;
  virtual void showConfigOption(const std::vector<std::string>& configurations) = 0;
  virtual void setMaxNumberOfLogs(double count) = 0;
  virtual void setSondrelConfigurations(std::vector<std::string> configurations) = 0;
  /// Shows `alert` over the screen.
  virtual void present(Alert alert) = 0;
};

}  // namespace quorl
