#include "batch/Files.h"

#include "batch/Messages.h"
#include "interfaces/portability/File.h"

bool probeFile(const char* path) {
  return Port::File::probe(path) || Messages::failure("Open file error, file %s may not exist\n", path);
}
