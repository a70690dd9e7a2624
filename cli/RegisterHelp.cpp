#include <cli/RegisterHelp.h>

namespace cli {

const std::string_view registerHelp =
    R"(swinv register - have another object manager load the providers

Usage: swinv register --for sfcb|pegasus [OPTIONS]

Hands the classes and the registrations of both providers to the tools of an
object manager that is installed here, with the full CIM schema:

  sfcb      sfcbstage for each library, then sfcbrepos; restart it afterwards
  pegasus   cimmof for the classes in root/cimv2 and the registrations in
            root/PG_InterOp, then cimprovider shows them; it must be running

The object manager must find the libraries: docs/deploy.md says how, and what to
look at when there are no answers.

Options:
  --for sfcb|pegasus       whose tools to run
  --print                  print what would be run, and run nothing

Exit status: 0 registered, 1 a tool is missing or failed; nothing after it was
run.

Examples:
  swinv register --for sfcb --print
  sudo swinv register --for pegasus
)";

const std::string_view unregisterHelp =
    R"(swinv unregister - take the providers out of another object manager

Usage: swinv unregister --for sfcb|pegasus [OPTIONS]

Undoes "swinv register" with the tools of that object manager:

  sfcb      sfcbunstage for each library, then sfcbrepos; restart it afterwards
  pegasus   cimprovider removes both modules; the classes, which are nobody's
            then, stay in root/cimv2

Options:
  --for sfcb|pegasus       whose tools to run
  --print                  print what would be run, and run nothing

Examples:
  swinv unregister --for sfcb --print
  sudo swinv unregister --for pegasus
)";

}  // namespace cli
