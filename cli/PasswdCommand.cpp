#include <cimom/http/Passwords.h>
#include <cli/Commands.h>
#include <cli/Messages.h>
#include <cli/SecretInput.h>

namespace cli {
namespace {

void remove(const PasswdOptions& options, Output& output) {
  if (!cimom::http::removePassword(options.file, options.user)) {
    throw CommandError("there is no user '" + options.user + "' in " + options.file);
  }
  output.write("Removed " + options.user + " from " + options.file + "\n");
}

void set(const PasswdOptions& options, Output& output) {
  std::string password = readNewPassword(options.user);
  const bool isNew = cimom::http::setPassword(options.file, options.user, password);
  wipe(password);
  output.write((isNew ? "Added " : "Changed the password of ") + options.user + (isNew ? " to " : " in ") +
               options.file + "\n");
}

}  // namespace

void runPasswd(const Options& options, Output& output) {
  try {
    options.passwd.remove ? remove(options.passwd, output) : set(options.passwd, output);
  } catch (const cimom::http::PasswordError& error) {
    throw CommandError(error.what());
  }
}

}  // namespace cli
