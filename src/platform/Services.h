#pragma once

#include <filesystem>
#include <functional>
#include <map>
#include <optional>
#include <string>
#include <string_view>
#include <utility>

namespace quorl {

/// The device property service.
class DeviceProperties {
 public:
  virtual ~DeviceProperties() = default;
  /// False when the property is absent.
  virtual bool boolean(std::string_view name) = 0;
  /// Nothing when the property is absent.
  virtual std::optional<std::string> text(std::string_view name) = 0;
  /// Whether a class of the system's libraries is present on this device, such as "Sondrel" for log capture.
  virtual bool hasClass(std::string_view name) = 0;
};

/// Resources of the application: named, typed files.
class Resources {
 public:
  virtual ~Resources() = default;
  /// The path of `name`.`type`, or nothing when there is no such file.
  virtual std::optional<std::filesystem::path> path(std::string_view name, std::string_view type) = 0;
};

/// The application's per-user documents directory.
class DocumentsDirectory {
 public:
  virtual ~DocumentsDirectory() = default;
  /// The directory, made (0700) if it is missing; nothing when it cannot be had.
  virtual std::optional<std::filesystem::path> path() = 0;
};

/// The string table "Localizable".
class StringTable {
 public:
  virtual ~StringTable() = default;
  /// The translation of `key`, or `key` itself. Called on any thread.
  virtual std::string localized(std::string_view key) = 0;
};

/// The process's console: what the product prints, as opposed to logs.
class Console {
 public:
  virtual ~Console() = default;
  /// One line, without its line break. Called on any thread.
  virtual void print(std::string_view line) = 0;
};

/// A dialog with one button, shown over everything else.
struct Alert {
  std::string title;
  std::string message;
  std::string button;
  std::function<void()> onPress;  // main thread; may be empty
};

class AlertPresenter {
 public:
  virtual ~AlertPresenter() = default;
  /// Shows `alert` and returns at once. Main thread.
  virtual void present(Alert alert) = 0;
};

/// The analytics event sink. A system without one may simply log.
class AnalyticsSink {
 public:
  using Payload = std::map<std::string, std::string>;
  virtual ~AnalyticsSink() = default;
  virtual void send(std::string_view event, const Payload& payload) = 0;
};

/// One text for the user to take away. It is made piece by piece each time it is asked for, as it may be too large to
/// be held whole.
class SharedText {
 public:
  /// Takes a piece, which is valid during the call. False ends the text there.
  using Sink = std::function<bool(std::string_view piece)>;
  /// Gives the pieces to a sink, in their order, until it answers false. Any thread, any number of times.
  using Writer = std::function<void(const Sink& sink)>;

  SharedText(std::string fileName, Writer writer) : fileName_(std::move(fileName)), writer_(std::move(writer)) {}

  /// What a file of it is called unless the user says otherwise: a name without a folder.
  const std::string& fileName() const { return fileName_; }
  void write(const Sink& sink) const { writer_(sink); }
  /// All of it.
  std::string text() const;

 private:
  std::string fileName_;
  Writer writer_;
};

/// Hands one text to the user, whatever the user then does with it.
class ShareFacility {
 public:
  virtual ~ShareFacility() = default;
  /// Main thread.
  virtual void share(SharedText text) = 0;
};

class Pasteboard {
 public:
  virtual ~Pasteboard() = default;
  /// Main thread.
  virtual void setText(std::string_view text) = 0;
};

}  // namespace quorl
