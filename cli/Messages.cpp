#include <cli/Messages.h>
#include <cli/Output.h>
#include <cli/Terminal.h>
#include <cli/Text.h>

#include <algorithm>
#include <string>

#include <unistd.h>

namespace cli {

void complain(std::string_view text, std::string_view mark) {
  const Charset charset = terminalAt(STDERR_FILENO).values;
  std::string message(mark);
  message.append("swinv: ");
  while (!text.empty()) {
    const std::size_t end = std::min(text.find('\n'), text.size());
    message.append(printable(text.substr(0, end), charset)).append("\n");
    text.remove_prefix(std::min(end + 1, text.size()));
  }
  // One write for the whole message; where standard error is gone, nobody is left to be told.
  Output error(STDERR_FILENO);
  error.write(message);
  error.flush();
}

}  // namespace cli
