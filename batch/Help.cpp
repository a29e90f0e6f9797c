#include <algorithm>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/utility/TesselCmdargs.h"

namespace {

/// Lists from the first index up to but not including the last one.
void list(const std::vector<StringBase>& words, int first, int last) {
  for (int i = first; i < last; ++i) Messages::status("%s\n", words[static_cast<std::size_t>(i)]);
}

bool listAll(const std::vector<StringBase>& words) {
  list(words, 0, static_cast<int>(words.size()));
  return true;
}

void usage(const char* word) {
  const StringBase text = TesselCmdargs::findBatchFormatString(word);
  if (text.empty())
    Messages::status("Can't match this command, try help -c <command>\n.");
  else
    Messages::status("%s\n", text);
}

}  // namespace

bool CmdParser::help(UT_CMDARGS& args) {
  if (args.findsw("-all")) return listAll(TesselCmdargs::findAllCommands());
  if (const auto* word = args.getsw("-m", 0)) {
    usage(word->getargtxt(0));
    return true;
  }
  if (const auto* text = args.getsw("-c", 0)) return listAll(TesselCmdargs::findMatchingCommands(text->getargtxt(0)));
  const auto words = TesselCmdargs::findAllCommands();
  const int size = static_cast<int>(words.size());
  if (const auto* head = args.getsw("-head", 0)) {
    list(words, 0, std::min<int>(head->getargnum(0), size));
    return true;
  }
  const auto* tail = args.getsw("-tail", 0);
  if (tail == nullptr || size <= tail->getargnum(0)) return listAll(words);
  list(words, size - tail->getargnum(0), size);  // beyond the end for a negative number
  return true;
}
