#include <filesystem>
#include <string>

#include <gtest/gtest.h>

#include "hosts/simulator/PhoneServices.h"
#include "store/DefaultDashboard.h"
#include "support/TimeZoneAndLocale.h"

namespace quorl::test {
namespace {

/// A person who reads `language`.
class Reader {
 public:
  explicit Reader(const char* language) : language_(language) {}

  std::string sees(const std::string& name) { return strings_.localized(name); }

 private:
  const ScopedLanguage language_;
  simulator::GettextStrings strings_{{std::filesystem::path(QUORL_BINARY_DIR) / "share" / "quorl"}};
};

TEST(StringTable, NamesAreThoseOfTheReadersLanguage) {
  EXPECT_EQ(Reader("en").sees("rrc_state"), "RRC state");
  EXPECT_EQ(Reader("de").sees("rrc_state"), "RRC-Zustand");
  EXPECT_EQ(Reader("de_AT").sees("prio_of_camped_lte_band"), "Priorität des LTE-Bandes");
}

TEST(StringTable, WithoutATableEveryRawNameStands) {
  EXPECT_EQ(Reader("eo").sees("rrc_state"), "rrc_state");
  EXPECT_EQ(Reader("en").sees("t3402_ms"), "t3402_ms");
}

TEST(StringTable, NamesWhatTheFirstDashboardShows) {
  for (const char* language : {"en", "de"}) {
    Reader reader(language);
    for (const bool isMavDevice : {true, false})
      for (const Metric& pin : defaultDashboard(isMavDevice, {}))
        EXPECT_NE(reader.sees(pin.attributeName), pin.attributeName) << language;
  }
}

TEST(StringTable, NamesTheKeysOfACell) {
  for (const char* language : {"en", "de"}) {
    Reader reader(language);
    for (const char* key : {"RSRP", "MCC", "MNC", "RadioAccessTechnology", "CellRadioAccessTechnology", "CellType",
                            "Bandwidth", "DeploymentType", "CellId", "BandInfo", "TAC", "UARFCN"}) {
      const std::string name = std::string("kHVCellMonitor") + key;
      EXPECT_NE(reader.sees(name), name) << language;
    }
  }
}

}  // namespace
}  // namespace quorl::test
