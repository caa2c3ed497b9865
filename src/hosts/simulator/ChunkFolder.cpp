#include "hosts/simulator/ChunkFolder.h"

#include <algorithm>
#include <cctype>
#include <cerrno>
#include <charconv>
#include <string_view>
#include <system_error>

#include <fcntl.h>
#include <fmt/format.h>
#include <sys/stat.h>
#include <unistd.h>

#include "base/DateText.h"

namespace quorl::simulator {

namespace fs = std::filesystem;

namespace {

constexpr std::string_view kExtension = ".chunk";

std::string errorText(int code) {
  return std::generic_category().message(code);
}

tl::unexpected<SondrelError> cannotWrite(int code) {
  return tl::make_unexpected(SondrelError{fmt::format(
      "A log file cannot be written: {}. Earlier files are kept. Make room, then start again.", errorText(code))});
}

/// The number that a chunk's name begins with; nothing for a file that is no chunk.
std::optional<std::uint64_t> numberOf(const fs::path& path) {
  if (path.extension() != kExtension) return std::nullopt;
  const std::string name = path.filename().string();
  std::uint64_t number = 0;
  const auto [end, error] = std::from_chars(name.data(), name.data() + name.size(), number);
  if (error != std::errc() || *end != '-') return std::nullopt;
  return number;
}

std::string inFileName(std::string text) {
  for (char& character : text)
    if (std::isalnum(static_cast<unsigned char>(character)) == 0) character = '-';
  return text;
}

/// A new file with `text` at its beginning and a hole up to `bytes`. Answers 0 or the error's code.
int writeSparse(const fs::path& path, std::string_view text, std::uint64_t bytes) {
  const int file = ::open(path.c_str(), O_WRONLY | O_CREAT | O_EXCL | O_CLOEXEC, S_IRUSR | S_IWUSR);
  if (file < 0) return errno;
  const std::string_view kept = text.substr(0, bytes);
  int code = 0;
  if (::write(file, kept.data(), kept.size()) != static_cast<ssize_t>(kept.size()) ||
      ::ftruncate(file, static_cast<off_t>(bytes)) != 0)
    code = errno != 0 ? errno : EIO;
  if (::close(file) != 0 && code == 0) code = errno;
  if (code != 0) ::unlink(path.c_str());
  return code;
}

}  // namespace

tl::expected<void, SondrelError> ChunkFolder::open() {
  std::error_code error;
  if (::mkdir(folder_.c_str(), S_IRWXU) != 0 && errno != EEXIST) error = {errno, std::generic_category()};
  fs::directory_iterator entries;
  if (!error) entries = fs::directory_iterator(folder_, error);
  if (!error && ::access(folder_.c_str(), W_OK | X_OK) != 0) error = {errno, std::generic_category()};
  if (error)
    return tl::make_unexpected(SondrelError{
        fmt::format("The log folder cannot be written: {}. Nothing is captured.", errorText(error.value()))});

  chunks_.clear();
  usedBytes_ = 0;
  for (const fs::directory_entry& entry : entries) {
    const auto number = numberOf(entry.path());
    if (!number || !entry.is_regular_file(error)) continue;
    const std::uint64_t bytes = entry.file_size(error);
    if (error) continue;  // gone meanwhile
    chunks_.push_back({*number, entry.path(), bytes});
    usedBytes_ += bytes;
    lastNumber_ = std::max(lastNumber_, *number);
  }
  std::sort(chunks_.begin(), chunks_.end(), [](const Chunk& a, const Chunk& b) { return a.number < b.number; });
  return {};
}

tl::expected<SondrelFileInformation, SondrelError> ChunkFolder::write(const std::string& configuration,
                                                                      std::uint64_t bytes, Date date,
                                                                      const Content& content) {
  if (usedBytes_ + bytes > capacity_) return cannotWrite(ENOSPC);
  const std::uint64_t number = lastNumber_ + 1;
  const std::string name = fmt::format("{:06}-{}{}", number, inFileName(configuration), kExtension);
  std::string text = fmt::format("simulated baseband log\nconfiguration: {}\nchunk: {}\nbegun: {}\n", configuration,
                                 number, utcText(date));
  const fs::path path = folder_ / name;
  if (text.size() < bytes) text += content(bytes - text.size());
  if (const int code = writeSparse(path, text, bytes); code != 0) return cannotWrite(code);
  lastNumber_ = number;
  chunks_.push_back({number, path, bytes});
  usedBytes_ += bytes;
  return SondrelFileInformation{name, fmt::format("{} KB", bytes / 1024), date};
}

void ChunkFolder::keepAtMost(std::size_t count) {
  while (chunks_.size() > count) {
    std::error_code ignored;  // a chunk that somebody else has removed is gone all the same
    fs::remove(chunks_.front().path, ignored);
    usedBytes_ -= chunks_.front().bytes;
    chunks_.pop_front();
  }
}

}  // namespace quorl::simulator
