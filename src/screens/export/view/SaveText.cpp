#include "screens/export/view/SaveText.h"

#include <QDir>
#include <QLocale>
#include <QQmlEngine>
#include <QStandardPaths>
#include <filesystem>
#include <utility>

#include "platform/Platform.h"
#include "shell/view/QtText.h"

namespace quorl::view {

SaveText::SaveText() : folder_(QStandardPaths::writableLocation(QStandardPaths::DocumentsLocation)) {
  if (!QDir(folder_).exists()) folder_ = QDir::homePath();
}

SaveText& SaveText::shared() {
  static SaveText instance;
  return instance;
}

SaveText* SaveText::create(QQmlEngine* /*engine*/, QJSEngine* /*scriptEngine*/) {
  QJSEngine::setObjectOwnership(&shared(), QJSEngine::CppOwnership);
  return &shared();
}

void SaveText::share(SharedText text) {
  ++turn_;
  fileName_ = toQt(text.fileName());
  text_ = std::move(text);
  show(Stage::Asking);
}

void SaveText::setFolder(const QString& folder) {
  if (std::exchange(folder_, folder) != folder) emit changed();
}

QUrl SaveText::folderUrl() const {
  return QUrl::fromLocalFile(folder_);
}

void SaveText::setFileName(const QString& fileName) {
  if (std::exchange(fileName_, fileName) != fileName) emit changed();
}

QString SaveText::path() const {
  return QDir(folder_).filePath(fileName_);
}

void SaveText::save() {
  if (!QDir::isAbsolutePath(folder_)) {
    show(Stage::Asking, tr("A folder is given by its whole path, from “/” on. Nothing was written. Choose one."));
    return;
  }
  if (fileName_.trimmed().isEmpty() || fileName_.contains(QLatin1Char('/')) || fileName_ == QLatin1String("..") ||
      fileName_ == QLatin1String(".")) {
    show(Stage::Asking, tr("A file needs a name without “/”. Nothing was written. Give it another name."));
    return;
  }
  write(Overwrite::no);
}

void SaveText::replace() {
  if (stage_ == Stage::Replacing) write(Overwrite::yes);
}

void SaveText::keep() {
  if (stage_ == Stage::Replacing) show(Stage::Asking);
}

void SaveText::chooseFolder(const QUrl& url) {
  setFolder(url.toLocalFile());
}

void SaveText::close() {
  ++turn_;
  text_.reset();
  show(Stage::Closed);
}

void SaveText::write(Overwrite overwrite) {
  if (!text_) return;
  show(Stage::Writing, tr("Writing %1").arg(fileName_));
  // The singleton outlives the queues' tasks.
  Platform::current().backgroundQueue.async([this, turn = turn_, text = *text_, file = fromQt(path()), overwrite] {
    auto result = writeTextFile(std::filesystem::path(file), text, overwrite);
    Platform::current().mainQueue.async([this, turn, result = std::move(result)] {
      if (turn == turn_) didWrite(result);
    });
  });
}

void SaveText::didWrite(const tl::expected<std::uintmax_t, TextFileError>& result) {
  if (result) {
    text_.reset();
    show(Stage::Saved, tr("Saved %1 in %2.").arg(QLocale::c().formattedDataSize(static_cast<qint64>(*result)), path()));
  } else if (result.error().kind == TextFileError::Kind::exists) {
    show(Stage::Replacing, tr("%1 exists already. Replace it?").arg(fileName_));
  } else {
    show(Stage::Asking, tr("%1 could not be written: %2. The readings are kept and nothing has changed in the folder. "
                           "Choose another folder or name, and save again.")
                            .arg(path(), toQt(result.error().reason)));
  }
}

void SaveText::show(Stage stage, QString message) {
  stage_ = stage;
  message_ = std::move(message);
  emit changed();
}

}  // namespace quorl::view
