#include <algorithm>

#include "batch/CmdParser.h"
#include "batch/Messages.h"
#include "interfaces/utility/TesselCmdargs.h"

namespace {

void list(const std::vector<StringBase>& words, int first, int last) {
  for (int i = std::max(first, 0); i < last; ++i) Messages::status("%s\n", words[static_cast<std::size_t>(i)]);
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
  const bool listAll = args.findsw("-all");
  if (const auto* word = args.getsw("-m", 0); word != nullptr && !listAll) {
    usage(word->getargtxt(0));
    return true;
  }
  const auto* text = args.getsw("-c", 0);
  if (text != nullptr && !listAll) {
    const auto words = TesselCmdargs::findMatchingCommands(text->getargtxt(0));
    list(words, 0, static_cast<int>(words.size()));
    return true;
  }
  const auto words = TesselCmdargs::findAllCommands();
  const int size = static_cast<int>(words.size());
  const auto* head = args.getsw("-head", 0);
  const auto* tail = args.getsw("-tail", 0);
  int first = 0;
  int last = size;
  if (head != nullptr && !listAll)
    last = std::min<int>(head->getargnum(0), size);
  else if (tail != nullptr && !listAll && size > tail->getargnum(0))
    first = size - tail->getargnum(0);  // beyond the end for a negative number
  list(words, first, last);
  return true;
}
