#include <agent/framework/InventoryFile.h>
#include <cli/Commands.h>
#include <cli/FileWriter.h>
#include <cli/JsonOutput.h>
#include <cli/Messages.h>
#include <cli/Progress.h>
#include <cli/Source.h>
#include <cli/Terminal.h>
#include <cli/TreePrinter.h>

#include <string>

#include <unistd.h>

namespace cli {
namespace {

agent::NodeTree readMachine() {
  const agent::TreeSource source = checkedSource();
  const Progress progress("Reading the machine");
  return readTreeOf(source);
}

std::string inventoryText(const agent::NodeTree& tree) {
  try {
    return agent::writeInventory(tree);
  } catch (const agent::InventoryError& error) {
    throw CommandError(error.what());
  }
}

}  // namespace

void runTree(const Options& options, Output& output) {
  const agent::NodeTree tree = readMachine();
  if (options.format == Format::Json) {
    output.write(escapeHighControls(inventoryText(tree)));
  } else {
    output.write(printTree(tree, terminalAt(STDOUT_FILENO)));
  }
}

void runCapture(const Options& options, Output& output) {
  const std::string text = inventoryText(readMachine());
  if (options.captureFile == "-") {
    output.write(escapeHighControls(text));
  } else {
    writeWhole(options.captureFile, text, options.force);
  }
}

}  // namespace cli
