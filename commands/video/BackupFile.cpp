// The only file that sees Qt.
#include "commands/video/BackupFile.h"

#include <QFile>
#include <QFileInfo>

extern "C" __attribute__((visibility("default"))) void talixBackUpFile(char const* path, std::string& copy) {
  QString const source = QFile::decodeName(path);
  QFileInfo const info(source);
  QString const backup = info.canonicalPath() + "/" + info.baseName() + "_Original." + info.completeSuffix();
  QFile::remove(backup);
  QFile::copy(source, backup);
  copy = QFile::encodeName(backup).toStdString();
}
