#include <cli/HelpTexts.h>

namespace cli {
namespace {

constexpr std::string_view programHelp =
    R"(swinv - the software and firmware of this machine, asked through CIM

Usage: swinv COMMAND [ARGUMENTS] [OPTIONS]

Commands:
  list [CLASS]     show the instances of a class (KELVO_SoftwareIdentity)
  names [CLASS]    show the object paths of all instances
  get OBJECT       show one instance, named by its InstanceID or its object path
  tree             show the tree of devices that the inventory is made of
  capture FILE     save that tree as an inventory file

Options:
  --format table|json|csv  how to print (default: table; tree has no csv)
  --property NAME[,...]    list, get: these properties, in this order;
                           repeatable
  --inventory FILE         show the machine that an inventory file describes
  --system-root DIR        show the machine whose sys/, proc/, lib/ are in DIR
  --provider FILE          load this provider library, not the installed one
  --log-level off|error|trace
                           what the provider logs, on standard error (off)
  --force                  capture: replace an existing file
  --version                print the version and stop
  --help, -h               print this help; after a command, that command's help

Without --inventory and --system-root it is the live machine that is shown. No
command needs root; what an ordinary user may not read is left out, and "swinv
tree" says what that was.

Exit status: 0 done, 1 the request failed, 2 the command line is wrong.

Examples:
  swinv list                             what is installed, as a table
  swinv list --format json | jq -r '.[].VersionString'
  swinv list --property InstanceID,VersionString --format csv > versions.csv
  swinv get 1@3b2                        one element with all its properties
  swinv capture server.json              save this machine ...
  swinv list --inventory server.json     ... and show it elsewhere

More: man swinv, or swinv COMMAND --help
)";

constexpr std::string_view listHelp =
    R"(swinv list - show all instances of a class

Usage: swinv list [CLASS] [OPTIONS]

CLASS is a class of the schema; without it, KELVO_SoftwareIdentity: each
firmware, BIOS and driver of the machine.

Options:
  --format table|json|csv  table (default): the most telling properties, cut to
                           the width of the terminal; json: a list of objects
                           with every property that has a value; csv: a column
                           for every property
  --property NAME[,...]    these properties alone, in this order; repeatable
  --inventory FILE         show the machine that an inventory file describes
  --system-root DIR        show the machine whose sys/, proc/, lib/ are in DIR
  --provider FILE          load this provider library, not the installed one
  --log-level off|error|trace
                           what the provider logs, on standard error (off)

Examples:
  swinv list
  swinv list --property Description,VersionString
  swinv list --format json --inventory server.json
)";

constexpr std::string_view namesHelp =
    R"(swinv names - show the object paths of all instances of a class

Usage: swinv names [CLASS] [OPTIONS]

Prints one WBEM URI a line, as "swinv get" takes them.

Options:
  --format table|json|csv  json and csv also have the keys (default: table)
  --inventory FILE         show the machine that an inventory file describes
  --system-root DIR        show the machine whose sys/, proc/, lib/ are in DIR
  --provider FILE          load this provider library, not the installed one
  --log-level off|error|trace
                           what the provider logs, on standard error (off)

Examples:
  swinv names
  swinv names | while read -r path; do swinv get "$path"; done
)";

constexpr std::string_view getHelp =
    R"(swinv get - show one instance with all its properties

Usage: swinv get OBJECT [OPTIONS]

OBJECT is the InstanceID of a KELVO_SoftwareIdentity, or the object path of an
instance of any class, as "swinv names" prints it.

Options:
  --format table|json|csv  table (default): a line for each property that has a
                           value
  --property NAME[,...]    these properties alone, in this order; repeatable
  --inventory FILE         show the machine that an inventory file describes
  --system-root DIR        show the machine whose sys/, proc/, lib/ are in DIR
  --provider FILE          load this provider library, not the installed one
  --log-level off|error|trace
                           what the provider logs, on standard error (off)

Examples:
  swinv get 1@3b2
  swinv get 'root/cimv2:KELVO_SoftwareIdentity.InstanceID="1@3b2"' --format json
)";

constexpr std::string_view treeHelp =
    R"(swinv tree - show the tree of devices that the inventory is made of

Usage: swinv tree [OPTIONS]

A line for each node: its type, description, name and version, the devices that
a driver drives, and in brackets the InstanceID of a software element, or the
number before the "@" in the InstanceIDs of the software directly below the
node. At the end stands what could not be read, and why.

Options:
  --format table|json      json: the tree as an inventory file (default: table)
  --inventory FILE         show the machine that an inventory file describes
  --system-root DIR        show the machine whose sys/, proc/, lib/ are in DIR

Examples:
  swinv tree
  swinv tree --inventory server.json
)";

constexpr std::string_view captureHelp =
    R"(swinv capture - save the tree of this machine as an inventory file

Usage: swinv capture FILE [OPTIONS]

The file can be shown anywhere with --inventory. It appears whole or not at all;
an existing file is left alone. FILE "-" is standard output.

Options:
  --force                  replace an existing file
  --inventory FILE         save the machine of another inventory file
  --system-root DIR        save the machine whose sys/, proc/, lib/ are in DIR

Examples:
  swinv capture server.json
  swinv capture - | gzip > server.json.gz
)";

}  // namespace

std::string_view helpText(std::optional<Command> command) {
  if (!command) {
    return programHelp;
  }
  switch (*command) {
    case Command::List:
      return listHelp;
    case Command::Names:
      return namesHelp;
    case Command::Get:
      return getHelp;
    case Command::Tree:
      return treeHelp;
    case Command::Capture:
      return captureHelp;
  }
  return programHelp;
}

std::string_view commandName(Command command) {
  switch (command) {
    case Command::List:
      return "list";
    case Command::Names:
      return "names";
    case Command::Get:
      return "get";
    case Command::Tree:
      return "tree";
    case Command::Capture:
      return "capture";
  }
  return {};
}

}  // namespace cli
