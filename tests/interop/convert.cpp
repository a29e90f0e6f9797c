// Converts a file of memory content into another format, both by their extensions: tessel-convert FROM TO

#include <cstdio>
#include <string>

#include "manager/content/DataFile.h"

namespace {

int fail(const std::string& text) {
  std::fprintf(stderr, "%s\n", text.c_str());
  return 1;
}

}  // namespace

int main(int count, char** words) {
  if (count != 3) return fail("usage: tessel-convert FROM TO");
  const std::string from = words[1];
  const std::string to = words[2];
  const auto fromFormat = DataFile::formatOf(from);
  const auto toFormat = DataFile::formatOf(to);
  if (!fromFormat || !toFormat) return fail("the extensions .bin, .mcs, .exo and .hex are known");
  const auto image = DataFile::read(from, *fromFormat);
  if (!image) return fail(image.failure().text);
  const Status written = DataFile::write(to, *image, *toFormat);
  return written ? 0 : fail(written.failure().text);
}
