#include "hosts/simulator/PhoneServices.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <system_error>
#include <utility>

#include <libintl.h>
#include <sys/stat.h>

#include "base/Log.h"

namespace quorl::simulator {

namespace fs = std::filesystem;

namespace {

constexpr Logger hostLog{"host"};
constexpr char kDomain[] = "Localizable";

/// In one piece, as other threads print as well.
void printLine(std::string_view line, std::FILE* output) {
  std::string whole(line);
  whole.push_back('\n');
  std::fwrite(whole.data(), 1, whole.size(), output);
}

}  // namespace

bool DescribedDevice::boolean(std::string_view name) {
  if (name == "InternalBuild") return description_.isInternalBuild;
  if (name == "CarrierInstallCapability") return description_.isCarrierBuild;
  return false;
}

std::optional<std::string> DescribedDevice::text(std::string_view name) {
  if (name == "BasebandChipset") return description_.chipset;
  if (name == "DeviceClass") return description_.deviceClass;
  return std::nullopt;
}

bool DescribedDevice::hasClass(std::string_view name) {
  const auto& classes = description_.systemClasses;
  return std::find(classes.begin(), classes.end(), name) != classes.end();
}

std::optional<fs::path> ResourceDirectories::path(std::string_view name, std::string_view type) {
  const std::string file = std::string(name) + "." + std::string(type);
  for (const fs::path& directory : directories_) {
    std::error_code ignored;
    const fs::path candidate = directory / file;
    if (fs::is_regular_file(candidate, ignored)) return candidate;
  }
  return std::nullopt;
}

std::vector<fs::path> ResourceDirectories::ofThisProgram(const fs::path& buildTree) {
  std::vector<fs::path> directories;
  std::error_code error;
  const fs::path program = fs::read_symlink("/proc/self/exe", error);
  if (!error) directories.push_back(program.parent_path().parent_path() / "share" / "quorl");
  directories.push_back(buildTree);
  return directories;
}

std::optional<fs::path> FixedDocumentsDirectory::path() {
  std::error_code error;
  if (!fs::is_directory(directory_, error)) {
    const fs::path absolute = fs::absolute(directory_, error).lexically_normal();
    const fs::path own = absolute.has_filename() ? absolute : absolute.parent_path();
    fs::create_directories(own.parent_path(), error);
    int reason = error.value();
    if (reason == 0 && ::mkdir(own.c_str(), S_IRWXU) != 0) reason = errno;
    if (reason != 0 && !fs::is_directory(own, error)) {
      errno = reason == EEXIST ? ENOTDIR : reason;
      return std::nullopt;
    }
  }
  return directory_;
}

GettextStrings::GettextStrings(const std::vector<fs::path>& resources) {
  for (const fs::path& directory : resources) {
    std::error_code ignored;
    const fs::path catalogues = directory / "locale";
    if (!fs::is_directory(catalogues, ignored)) continue;
    bindtextdomain(kDomain, catalogues.c_str());
    break;
  }
  bind_textdomain_codeset(kDomain, "UTF-8");
}

std::string GettextStrings::localized(std::string_view key) {
  if (key.empty()) return {};  // gettext answers a catalogue's header for it
  return dgettext(kDomain, std::string(key).c_str());
}

void StandardErrorConsole::print(std::string_view line) {
  if (isShown_) printLine(line, stderr);
}

void StandardOutputConsole::print(std::string_view line) {
  printLine(line, stdout);
  std::fflush(stdout);
}

void PrintedAlerts::present(Alert alert) {
  console_.print(alert.title + ": " + alert.message + " [" + alert.button + "]");
  if (alert.onPress) mainQueue_.async(std::move(alert.onPress));
}

void LoggedAnalytics::send(std::string_view event, const Payload& payload) {
  hostLog.log("analytics: %{public}s with %{public}d entries", event, payload.size());
}

}  // namespace quorl::simulator
