// The only file that sees Qt.
#include "commands/video/BackupFile.h"

#include <QFile>
#include <QFileInfo>

HString backUpFile(HString const& path) {
  QString const source = QFile::decodeName(path.GetStr());
  QFileInfo const info(source);
  QString const backup = info.canonicalPath() + "/" + info.baseName() + "_Original." + info.completeSuffix();
  QFile::remove(backup);
  QFile::copy(source, backup);
  return QFile::encodeName(backup).constData();
}
