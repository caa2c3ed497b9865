#pragma once

#include <filesystem>
#include <optional>
#include <string>
#include <string_view>
#include <utility>
#include <vector>

#include "base/Queue.h"
#include "platform/Services.h"

// The platform's small services as a phone without a screen has them.

namespace quorl::simulator {

/// What the device says of itself.
struct DeviceDescription {
  std::optional<std::string> chipset;
  std::optional<std::string> deviceClass;
  bool isInternalBuild = false;
  bool isCarrierBuild = false;
  std::vector<std::string> systemClasses;  // present on the device, such as "Sondrel"
};

class DescribedDevice final : public DeviceProperties {
 public:
  explicit DescribedDevice(DeviceDescription description) : description_(std::move(description)) {}
  bool boolean(std::string_view name) override;
  std::optional<std::string> text(std::string_view name) override;
  bool hasClass(std::string_view name) override;

 private:
  const DeviceDescription description_;
};

/// Resources as files of some directories; the first that has the file wins.
class ResourceDirectories final : public Resources {
 public:
  explicit ResourceDirectories(std::vector<std::filesystem::path> directories) : directories_(std::move(directories)) {}
  std::optional<std::filesystem::path> path(std::string_view name, std::string_view type) override;

  /// Where the resources of a program may be: beside the installed program, then in `buildTree`.
  static std::vector<std::filesystem::path> ofThisProgram(const std::filesystem::path& buildTree);

 private:
  const std::vector<std::filesystem::path> directories_;
};

class FixedDocumentsDirectory final : public DocumentsDirectory {
 public:
  explicit FixedDocumentsDirectory(std::filesystem::path directory) : directory_(std::move(directory)) {}
  /// A directory that is already there keeps its permissions. With nothing, `errno` says why.
  std::optional<std::filesystem::path> path() override;

 private:
  const std::filesystem::path directory_;
};

/// The gettext domain "Localizable" in the process's locale.
class GettextStrings final : public StringTable {
 public:
  /// Catalogues are looked for in the `locale` folder of the first of `resources` that has one.
  explicit GettextStrings(const std::vector<std::filesystem::path>& resources);
  std::string localized(std::string_view key) override;
};

/// Standard error: standard output belongs to a program's results.
class StandardErrorConsole final : public Console {
 public:
  /// One that is not shown prints nothing.
  explicit StandardErrorConsole(bool isShown = true) : isShown_(isShown) {}
  void print(std::string_view line) override;

 private:
  const bool isShown_;
};

/// Standard output, for a program that has no results to show there. Each line is shown at once.
class StandardOutputConsole final : public Console {
 public:
  void print(std::string_view line) override;
};

/// Prints a dialog and presses its button, once what is at hand has ended.
class PrintedAlerts final : public AlertPresenter {
 public:
  PrintedAlerts(Console& console, Queue& mainQueue) : console_(console), mainQueue_(mainQueue) {}
  void present(Alert alert) override;

 private:
  Console& console_;
  Queue& mainQueue_;
};

class LoggedAnalytics final : public AnalyticsSink {
 public:
  void send(std::string_view event, const Payload& payload) override;
};

/// Keeps the text that was shared last, for the host to do something with it.
class KeptShare final : public ShareFacility {
 public:
  void share(SharedText text) override { text_ = text.text(); }
  /// Nothing if nothing was shared yet.
  const std::optional<std::string>& text() const { return text_; }

 private:
  std::optional<std::string> text_;
};

class KeptPasteboard final : public Pasteboard {
 public:
  void setText(std::string_view text) override { text_ = text; }
  const std::string& text() const { return text_; }

 private:
  std::string text_;
};

}  // namespace quorl::simulator
