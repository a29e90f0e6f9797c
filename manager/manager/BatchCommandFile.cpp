#include "manager/manager/BatchCommandFile.h"

#include <cerrno>
#include <cstring>

#include "interfaces/portability/File.h"
#include "manager/support/Report.h"

void BatchCommandFile::rename(const std::string& path) {
  if (path == path_) return;
  stream_.reset();
  path_ = path;
  failed_ = false;
}

bool BatchCommandFile::write(const std::string& line) {
  if (failed_) return false;
  if (stream_ == nullptr) stream_ = Port::File::open(path_.c_str(), Port::File::extend, true);
  if (stream_ == nullptr) return fail(errno);
  *stream_ << line.c_str() << Port::endl;
  return stream_->error() == 0 || fail(stream_->error());
}

bool BatchCommandFile::fail(int error) {
  failed_ = true;
  stream_.reset();
  return reportError(
      "Batch-command file %s can't be written: %s. Steps are not recorded; name another file with "
      "renameBatchCmdFile.\n",
      path_, std::strerror(error));
}
