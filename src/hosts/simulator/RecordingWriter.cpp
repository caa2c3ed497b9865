#include "hosts/simulator/RecordingWriter.h"

#include <cerrno>
#include <system_error>

namespace quorl::simulator {
namespace {

std::string systemText(int error) {
  return std::generic_category().message(error != 0 ? error : EIO);
}

}  // namespace

tl::expected<RecordingWriter, std::string> RecordingWriter::open(const std::filesystem::path& file) {
  errno = 0;
  std::FILE* opened = std::fopen(file.c_str(), "wbe");
  if (opened == nullptr) return tl::unexpected(systemText(errno));
  return RecordingWriter(opened);
}

void RecordingWriter::write(const RecordedEvent& event) {
  if (error_ != 0 || file_ == nullptr) return;
  std::string line = recordingLine(event);
  line.push_back('\n');
  errno = 0;
  if (std::fwrite(line.data(), 1, line.size(), file_.get()) != line.size()) {
    error_ = errno != 0 ? errno : EIO;
    return;
  }
  ++events_;
}

RecordingWriter::Outcome RecordingWriter::close() {
  if (file_ == nullptr) return {};
  errno = 0;
  if (std::fclose(file_.release()) != 0 && error_ == 0) error_ = errno != 0 ? errno : EIO;
  if (error_ != 0) return tl::unexpected(systemText(error_));
  return {};
}

}  // namespace quorl::simulator
