#include "ToolLog.h"

#include <utility>

#include <spdlog/sinks/ansicolor_sink.h>

#include "base/SpdlogSink.h"
#include "shell/LogCategories.h"

namespace quorl::tool {

std::shared_ptr<simulator::FailedRows> installToolLog(bool isVerbose) {
  std::shared_ptr<LogSink> output;
  if (isVerbose) {
    output = std::make_shared<SpdlogSink>(log_category::kFallbackSubsystem,
                                          std::make_shared<spdlog::sinks::ansicolor_stderr_sink_mt>());
  }
  auto log = std::make_shared<simulator::FailedRows>(std::move(output));
  installLogSink(log);
  return log;
}

}  // namespace quorl::tool
