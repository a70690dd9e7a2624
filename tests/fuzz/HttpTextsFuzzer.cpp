#include <cimom/http/BasicLogin.h>
#include <cimom/http/ListenAddress.h>
#include <cimom/http/Passwords.h>

#include <algorithm>
#include <stdexcept>
#include <string>

#include "Fuzzer.h"

namespace {

using cimom::http::Passwords;

void tryLogin(std::string_view input) {
  if (const auto login = cimom::http::parseBasicLogin(input)) {
    fuzz::promise(login->user.find(':') == std::string::npos, "a user with a colon");
    fuzz::promise((login->user + login->password).find('\0') == std::string::npos, "a login with a NUL");
    fuzz::promise(login->user.size() + login->password.size() < input.size(), "a login longer than its text");
  }
}

void tryAddress(std::string_view input) {
  try {
    const auto address = cimom::http::parseListenAddress(input);
    const std::string text = address.text();
    fuzz::promise(cimom::http::parseListenAddress(text).text() == text, "an address reads differently again");
  } catch (const std::invalid_argument&) {
    return;
  }
}

void tryPasswords(std::string_view input) {
  try {
    const Passwords passwords = Passwords::parse(input, "input");
    std::string again;
    for (const auto& [user, hash] : passwords.hashes()) {
      fuzz::promise(cimom::http::isUserName(user), "a user with no valid name");
      again.append(user).append(":").append(hash).append("\n");
    }
    fuzz::promise(Passwords::parse(again, "again").hashes() == passwords.hashes(),
                  "users read differently again");
  } catch (const cimom::http::PasswordError&) {
    return;
  }
}

}  // namespace

// What people and clients write: credentials, addresses, password files, names in the log.
void fuzz::tryOne(std::string_view input) {
  tryLogin(input);
  tryAddress(input);
  tryPasswords(input);
  const std::string safe = cimom::http::printable(input);
  promise(std::all_of(safe.begin(), safe.end(), [](char letter) { return letter >= ' ' && letter <= '~'; }),
          "a line of the log with control characters");
}
