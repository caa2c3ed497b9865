// The product on a simulated phone that takes metrics until somebody kills it, and tells of each row as soon as the
// product does: fault_writer DOCUMENTS FIRST. Metric number n carries the time FIRST + n, in milliseconds, and its
// report is one line with that number.

#include <charconv>
#include <cstdint>
#include <cstring>
#include <string>

#include <unistd.h>

#include "app/AppDelegate.h"
#include "app/ApplicationLoop.h"
#include "base/NotificationCenter.h"
#include "faults/NasEvent.h"
#include "hosts/simulator/SimulatedPhone.h"
#include "shell/NotificationNames.h"
#include "store/Metric.h"

namespace {

using namespace quorl;

void report(const Notification& news) {
  const auto* row = news.entry<Metric>(notification::kMetricObjectKey);
  if (row == nullptr || row->attributeNameNonLocalized != "timestamp") return;
  const std::string line = row->attributeValue + "\n";
  // One write, so that no report is cut in two.
  if (::write(STDOUT_FILENO, line.data(), line.size()) != static_cast<ssize_t>(line.size())) ::_exit(1);
}

}  // namespace

int main(int argc, char** argv) {
  std::uint64_t timestampMs = 0;
  if (argc != 3 || std::from_chars(argv[2], argv[2] + std::strlen(argv[2]), timestampMs).ec != std::errc()) return 2;

  simulator::SimulatedPhone::Options options;
  options.device.chipset = "ice15";
  options.documents = argv[1];
  options.resources = {QUORL_RESOURCE_DIRECTORY};
  options.isConsoleShown = false;
  simulator::SimulatedPhone phone(options);
  AppDelegate application;
  ApplicationLoop lifecycle(application);
  const auto observation = NotificationCenter::defaultCenter().observe(notification::kNewZelkorMetric, report);
  lifecycle.launch();
  for (;;) {
    for (int i = 0; i < 20; ++i)
      if (!phone.baseband().deliver(zelkor::kEventMetric, test::nasEvent(timestampMs++))) return 1;
    phone.runUntilAtRest();
  }
}
