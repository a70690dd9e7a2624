#include <cli/ServeHelp.h>

namespace cli {

const std::string_view serveHelp =
    R"(swinv serve - answer WBEM clients: CIM operations over HTTP

Usage: swinv serve [OPTIONS]

Serves what "swinv list" shows in the namespace root/cimv2, and in root/interop
what a console needs to find it. Prints the address of each listener, and runs
until SIGTERM or SIGINT, which finish what is under way (a second one ends at
once). SIGHUP reads certificates and passwords again, and looks at the machine
anew. Whoever asks on this machine needs no login: that is all that works
without options. Any other address needs TLS and a login.

Options:
  --listen [https://]ADDRESS[:PORT]
                           where; repeatable (127.0.0.1:5988, with TLS
                           127.0.0.1:5989). Port 0 is any free one. With TLS,
                           http://ADDRESS:PORT on loopback does without
  --tls-certificate FILE, --tls-key FILE
                           the certificate chain and its key, both PEM: every
                           listener speaks TLS 1.2 or 1.3
  --passwords FILE         who may log in, made with "swinv passwd"
  --client-ca FILE         whoever has a certificate from this CA may come in
  --max-connections N      connections at once (512)
  --stall-time SECONDS     a client that neither takes nor sends is cut after
                           as long (30)
  --inventory FILE         serve the machine that an inventory file describes
  --system-root DIR        serve the machine whose sys/, proc/, lib/ are in DIR
  --provider FILE          load this provider library, not the installed one; or
                           a registration file (*.reg): its classes are served
                           besides, by libraries that lie beside it
  --schema FILE            MOF with the classes of that registration; repeatable
  --log-level off|error|trace
                           what server and provider log, on standard error
                           (error)

Examples:
  swinv serve
  wbemcli -nl ei http://127.0.0.1:5988/root/cimv2:KELVO_SoftwareIdentity
  swinv passwd /etc/swinv/passwords ada
  swinv serve --listen 0.0.0.0:5989 --tls-certificate cert.pem \
    --tls-key key.pem --passwords /etc/swinv/passwords
  swinv serve --schema disks.mof --provider disks.reg
)";

const std::string_view passwdHelp =
    R"(swinv passwd - who may log in to "swinv serve"

Usage: swinv passwd FILE USER [OPTIONS]

Sets the user's password in FILE, which is made where there is none, and which
holds salted hashes alone. The password is asked for twice on a terminal, else
it is the first line of standard input. A server that runs reads the file again
on SIGHUP.

Options:
  --delete                 take the user out of the file

Examples:
  swinv passwd /etc/swinv/passwords ada
  pass show wbem | swinv passwd /etc/swinv/passwords monitoring
  swinv passwd /etc/swinv/passwords ada --delete
)";

}  // namespace cli
