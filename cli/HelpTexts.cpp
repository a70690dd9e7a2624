#include <cli/HelpTexts.h>
#include <cli/RegisterHelp.h>
#include <cli/ServeHelp.h>

namespace cli {
namespace {

constexpr std::string_view programHelp =
    R"(swinv - the software and firmware of this machine, asked through CIM

Usage: swinv COMMAND [ARGUMENTS] [OPTIONS]

Commands:
  list [CLASS]     show the instances of a class (KELVO_SoftwareIdentity)
  names [CLASS]    show the object paths of all instances
  get OBJECT       show one instance, named by its InstanceID or its object path
  associators OBJECT
                   show what belongs to a computer, a port, a firmware
  tree             show the tree of devices that the inventory is made of
  capture FILE     save that tree as an inventory file
  serve            answer WBEM clients over HTTP
  passwd FILE USER set the password of a user of "serve"
  register, unregister
                   have another object manager load the providers, or not

Options:
  --format table|json|csv  how to print (default: table; tree has no csv)
  --property NAME[,...]    list, get, associators: these properties, in this
                           order; repeatable
  --names                  associators: object paths, one a line
  --assoc-class CLASS, --result-class CLASS, --role ROLE, --result-role ROLE
                           associators: only along this association, objects
                           of this class, from and to these ends
  --inventory FILE         show the machine that an inventory file describes
  --system-root DIR        show the machine whose sys/, proc/, lib/ are in DIR
  --provider FILE          load this provider library, not the installed one; or
                           serve the classes of a registration file (*.reg) too
  --schema FILE            MOF with the classes of that registration; repeatable
  --log-level off|error|trace
                           what the provider logs, on standard error (off;
                           serve: error)
  --force                  capture: replace an existing file
  --listen ADDRESS:PORT, --tls-certificate FILE, --tls-key FILE,
  --passwords FILE, --client-ca FILE, --max-connections N, --stall-time SECONDS
                           serve: where, to whom, and with which bounds
  --delete                 passwd: take the user out of the file
  --for sfcb|pegasus, --print
                           register, unregister: whose tools to run, or show
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
  swinv associators 1@3b2                the computer and the port it belongs to
  swinv capture server.json              save this machine ...
  swinv list --inventory server.json     ... and show it elsewhere
  swinv serve                            answer WBEM clients on this machine

More: man swinv, or swinv COMMAND --help
)";

constexpr std::string_view listHelp =
    R"(swinv list - show all instances of a class

Usage: swinv list [CLASS] [OPTIONS]

CLASS is a class of the schema; without it, KELVO_SoftwareIdentity: each
firmware, BIOS and driver of the machine. There are also

  KELVO_ComputerSystem, KELVO_SPComputerSystem, KELVO_NetworkPort
                           computers, management controllers, network ports
  KELVO_InstalledSoftwareIdentity
                           which software is installed on which computer
  KELVO_BMCSoftwareIdentity, KELVO_BIOSSoftwareIdentity
                           the firmware of management controllers, and BIOSes
  KELVO_NetworkSoftwareIdentity
                           the firmware of the first network device, each with
                           the device's first port; for all others ask "swinv
                           associators"

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
  swinv list KELVO_NetworkPort
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

OBJECT is the InstanceID of a KELVO_SoftwareIdentity; an instance of any class
in short, CLASS=NAME, as tables print it; or its object path, as "swinv names"
prints it. Of the associations, KELVO_InstalledSoftwareIdentity alone can be
asked for one at a time.

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
  swinv get KELVO_NetworkPort=0000:3b:00.0/1
  swinv get 'root/cimv2:KELVO_SoftwareIdentity.InstanceID="1@3b2"' --format json
)";

constexpr std::string_view associatorsHelp =
    R"(swinv associators - show what an object belongs to, and what belongs to it

Usage: swinv associators OBJECT [OPTIONS]

OBJECT is an InstanceID; CLASS=NAME, as tables print it; or an object path, as
"swinv names" prints it.

  of                       are shown                             along
  any software element     the computer that it is installed on  Installed
  "BIOS" firmware          its computer                          BIOS
  "BMC Firmware"           its management controller             BMC
  firmware of a network    the first port of its device, no      Network
  device                   other
  KELVO_ComputerSystem     all software; its BIOS                Installed, BIOS
  KELVO_SPComputerSystem   its firmware                          BMC
  KELVO_NetworkPort        all firmware of its device            Network

The names of the associations are KELVO_InstalledSoftwareIdentity, and so on.
Of several computers, each is shown the software of all. "swinv list
KELVO_NetworkSoftwareIdentity" shows the first network device alone.

Options:
  --assoc-class CLASS      along this association, or those derived from it
  --result-class CLASS     objects of this class, or of those derived from it
  --role ROLE              where OBJECT is this end of the association: System,
                           InstalledSoftware, Antecedent, Dependent
  --result-role ROLE       where what is shown is that end
  --names                  object paths, one a line, as these commands take them
  --format table|json|csv  table (default): one for each class; json: a list of
                           objects, each with its path as "@path"; csv: the
                           path and a column for every property
  --property NAME[,...]    these properties alone, in this order; repeatable
  --inventory FILE         show the machine that an inventory file describes
  --system-root DIR        show the machine whose sys/, proc/, lib/ are in DIR
  --provider FILE          load this provider library, not the installed one
  --log-level off|error|trace
                           what the provider logs, on standard error (off)

Examples:
  swinv associators 1@3b2
  swinv associators KELVO_NetworkPort=0000:3b:00.0/1 --names
  swinv names KELVO_NetworkPort | while read -r port; do
    swinv associators "$port" --property Description,VersionString; done
)";

constexpr std::string_view treeHelp =
    R"(swinv tree - show the tree of devices that the inventory is made of

Usage: swinv tree [OPTIONS]

A line for each node: its type, description, name and version, the devices that
a driver drives, and in brackets the InstanceID of a software element, or the
number before the "@" in the InstanceIDs of the software directly below the
node. At the end stands what could not be read, and why.

Behind a semicolon stands what the associations make of a software element:
  on NAME                     installed on this computer
  is its BIOS                 of that computer
  runs its service processor  the firmware of its management controller
  serves port NAME            the first port of the device that it is part of

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
    case Command::Associators:
      return associatorsHelp;
    case Command::Tree:
      return treeHelp;
    case Command::Capture:
      return captureHelp;
    case Command::Serve:
      return serveHelp;
    case Command::Passwd:
      return passwdHelp;
    case Command::Register:
      return registerHelp;
    case Command::Unregister:
      return unregisterHelp;
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
    case Command::Associators:
      return "associators";
    case Command::Tree:
      return "tree";
    case Command::Capture:
      return "capture";
    case Command::Serve:
      return "serve";
    case Command::Passwd:
      return "passwd";
    case Command::Register:
      return "register";
    case Command::Unregister:
      return "unregister";
  }
  return {};
}

}  // namespace cli
