#pragma once

#include <memory>
#include <string>

#include "interfaces/portability/Stream.h"

/// The batch-command file: one line a step, added to what the file holds. It is made when the first line
/// is written, in the directory that is current then, and every line reaches the file at once.
class BatchCommandFile {
 public:
  /// Writes the following lines into another file.
  void rename(const std::string& path);
  /// False when the line could not be written; the first failure of a file is reported.
  bool write(const std::string& line);

 private:
  bool fail(int error);

  std::string path_ = "_tesselbatch.cmd";
  std::unique_ptr<Port::Stream> stream_;
  bool failed_ = false;
};
