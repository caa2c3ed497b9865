#include <cstddef>
#include <cstdint>
#include <cstdlib>
#include <memory>
#include <optional>
#include <string_view>

#include "intake/MetricGroupV2.h"
#include "intake/MetricService.h"
#include "intake/ZelkorWrapper.h"
#include "support/FakePlatform.h"
#include "support/MetricEvent.h"
#include "support/RowsOnlyStore.h"

// The first byte chooses the baseband family, the second a row of the catalogue for the metric id, the rest is the
// payload. Every row that comes out must be whole.

namespace {

using quorl::Metric;

class CheckingStore final : public quorl::test::RowsOnlyStore {
 public:
  void insertMetric(Metric metric, WriteCompletion completion) override {
    if (metric.attributeName.empty() || metric.attributeValue.empty() || metric.attributeValueType.empty())
      std::abort();
    completion(true, std::nullopt);
  }
  void fetchMetricContents(std::string_view /*metricTech*/, std::string_view /*metricName*/,
                           std::optional<std::string_view> /*attributeName*/, std::int32_t /*subsId*/,
                           MetricsCompletion completion) override {
    completion({}, std::nullopt);
  }
};

class Phone {
 public:
  explicit Phone(const char* chipset) {
    platform_.properties.texts["BasebandChipset"] = chipset;
    service_ = quorl::MetricService::make(store_, quorl::ZelkorWrapper::sharedInstance());
  }
  void deliver(std::int64_t metricId, std::string_view payload) {
    service_->metricsDidUpdate(quorl::test::metricEvent(metricId, quorl::ByteString(payload)));
  }

 private:
  quorl::test::FakePlatform platform_;
  CheckingStore store_;
  std::shared_ptr<quorl::MetricService> service_;
};

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
  if (size < 2) return 0;
  // Never freed at the end: the product's shared objects, which it resets, may be gone by then.
  static Phone* phone = nullptr;
  static int family = -1;
  // The shared objects are made for one device; another family needs them anew.
  if (family != data[0] % 2) {
    family = data[0] % 2;
    delete phone;
    phone = new Phone(family == 0 ? "mav" : "ice");
  }
  const auto& rows = quorl::MetricGroupV2::metricGroupData();
  phone->deliver(rows[data[1] % rows.size()].zelkorId, {reinterpret_cast<const char*>(data) + 2, size - 2});
  return 0;
}
