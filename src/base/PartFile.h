#pragma once

#include <filesystem>
#include <string>
#include <string_view>

namespace quorl {

/// Writes all of `text` to an open file. False after an error, which is in `errno`.
bool writeAll(int file, std::string_view text);

/// A file beside its later place, for its owner alone, which goes away unless it is moved there. One thread at a time.
class PartFile {
 public:
  /// `target` is the later place; its folder must be there.
  explicit PartFile(const std::filesystem::path& target);
  ~PartFile();
  PartFile(const PartFile&) = delete;
  PartFile& operator=(const PartFile&) = delete;

  /// 0, or the code of the first error so far. After one, only this may be asked.
  int error() const { return error_; }
  /// The open file; it stays this object's.
  int descriptor() const { return file_; }

  bool write(std::string_view piece);
  void flush();
  /// What the system has to say about the file only now is an error as well. Nothing can be written any more.
  void close();
  void moveTo(const std::filesystem::path& target, bool replacing);

 private:
  std::string name_;
  int file_ = -1;
  int error_ = 0;
  bool isBeside_ = false;
};

}  // namespace quorl
