// The password file.
#include <crypt.h>
#include <gtest/gtest.h>
#include <sys/stat.h>

#include <cimom/http/Passwords.h>

#include <fstream>
#include <iterator>
#include <thread>

#include "TestServer.h"

namespace tests {
namespace {

using cimom::http::hashPassword;
using cimom::http::isUserName;
using cimom::http::PasswordError;
using cimom::http::Passwords;
using cimom::http::removePassword;
using cimom::http::setPassword;

// Made once: hashing is slow by design.
const std::string& yescrypt() {
  static const std::string hash = hashPassword("secret");
  return hash;
}

std::string sha512() {
  crypt_data data{};
  return crypt_r("secret", "$6$rounds=1000$saltsalt$", &data);
}

std::string refusal(const std::string& text) {
  try {
    (void)Passwords::parse(text, "file");
    return "accepted";
  } catch (const PasswordError& error) {
    return error.what();
  }
}

class PasswordFile : public testing::Test {
 protected:
  [[nodiscard]] std::string text() const {
    std::ifstream file(path_);
    return {std::istreambuf_iterator<char>(file), {}};
  }
  [[nodiscard]] unsigned mode() const {
    struct stat status {};
    EXPECT_EQ(::stat(path_.c_str(), &status), 0);
    return status.st_mode & 0777U;
  }

  Folder folder_;
  std::string path_ = folder_.path("passwords");
};

TEST(Passwords, AreVerified) {
  const Passwords passwords =
      Passwords::parse("# users\n\nanna:" + yescrypt() + "\nb\xC3\xA4rbel m:" + sha512(), "file");
  EXPECT_EQ(passwords.hashes().size(), 2U);
  EXPECT_TRUE(passwords.verify("anna", "secret"));
  EXPECT_FALSE(passwords.verify("anna", "Secret"));
  EXPECT_FALSE(passwords.verify("anna", ""));
  EXPECT_TRUE(passwords.verify("b\xC3\xA4rbel m", "secret"));
  EXPECT_FALSE(passwords.verify("Anna", "secret"));
  EXPECT_FALSE(passwords.verify("", "secret"));
  EXPECT_FALSE(Passwords::parse("", "file").verify("anna", "secret"));
}

TEST(Passwords, HaveSaltedHashes) {
  EXPECT_TRUE(yescrypt().starts_with("$y$"));
  EXPECT_NE(yescrypt(), hashPassword("secret"));
  EXPECT_THROW((void)hashPassword(""), PasswordError);
  EXPECT_THROW((void)hashPassword(std::string(600, 'x')), PasswordError);
  EXPECT_THROW((void)hashPassword(std::string("a\0b", 3)), PasswordError);
}

TEST(Passwords, LinesThatAreRefused) {
  EXPECT_NE(refusal("\nanna\n").find("file:2: a line has the form name:hash"), std::string::npos);
  EXPECT_NE(refusal(":" + yescrypt()).find("no valid name"), std::string::npos);
  EXPECT_NE(refusal("anna:secret").find("neither yescrypt"), std::string::npos);
  EXPECT_NE(refusal("anna:").find("neither yescrypt"), std::string::npos);
  EXPECT_NE(refusal("anna:$y$j9T$salt$").find("neither yescrypt"), std::string::npos);
  EXPECT_NE(refusal("anna:$1$salt$0123456789012345678901").find("neither yescrypt"), std::string::npos);
  EXPECT_NE(refusal("anna:" + yescrypt() + "\r\n").find("neither yescrypt"), std::string::npos);
  EXPECT_NE(
      refusal("anna:" + yescrypt() + "\nanna:" + sha512()).find("file:2: this user was on an earlier line"),
      std::string::npos);
}

TEST(Passwords, NamesOfUsers) {
  EXPECT_TRUE(isUserName("anna"));
  EXPECT_TRUE(isUserName("CN=anna, O=x"));
  EXPECT_TRUE(isUserName("b\xC3\xA4rbel"));
  EXPECT_FALSE(isUserName(""));
  EXPECT_FALSE(isUserName("a:b"));
  EXPECT_FALSE(isUserName("#anna"));
  EXPECT_FALSE(isUserName(" anna"));
  EXPECT_FALSE(isUserName("anna "));
  EXPECT_FALSE(isUserName("an\nna"));
  EXPECT_FALSE(isUserName("an\x7Fna"));
  EXPECT_FALSE(isUserName(std::string(129, 'x')));
}

TEST_F(PasswordFile, IsMadeWithTheFirstUser) {
  EXPECT_TRUE(setPassword(path_, "anna", "secret"));
  EXPECT_EQ(mode(), 0600U);
  EXPECT_TRUE(Passwords::read(path_).verify("anna", "secret"));
}

TEST_F(PasswordFile, KeepsWhatIsNotChanged) {
  const std::string start = "# ours\nanna:" + sha512() + "\nberta:" + sha512() + "\n# end";
  folder_.write("passwords", start, 0640);
  EXPECT_FALSE(setPassword(path_, "anna", "other"));
  EXPECT_TRUE(setPassword(path_, "clara", "third"));
  EXPECT_EQ(mode(), 0640U);
  const Passwords passwords = Passwords::read(path_);
  EXPECT_TRUE(passwords.verify("anna", "other"));
  EXPECT_FALSE(passwords.verify("anna", "secret"));
  EXPECT_TRUE(passwords.verify("berta", "secret"));
  EXPECT_TRUE(passwords.verify("clara", "third"));
  EXPECT_TRUE(text().starts_with("# ours\nanna:$y$")) << text();
  EXPECT_NE(text().find("\n# end\nclara:$y$"), std::string::npos) << text();
}

TEST_F(PasswordFile, LosesAUser) {
  folder_.write("passwords", "# ours\nanna:" + sha512() + "\nannabel:" + sha512() + "\n");
  EXPECT_TRUE(removePassword(path_, "anna"));
  EXPECT_FALSE(removePassword(path_, "anna"));
  EXPECT_EQ(text(), "# ours\nannabel:" + sha512() + "\n");
  EXPECT_FALSE(removePassword(folder_.path("none"), "anna"));
}

TEST_F(PasswordFile, StaysWhereItCannotBeChanged) {
  EXPECT_THROW((void)setPassword(path_, "an:na", "secret"), PasswordError);
  EXPECT_THROW((void)setPassword(path_, "anna", ""), PasswordError);
  EXPECT_THROW((void)setPassword(folder_.path("none/passwords"), "anna", "secret"), PasswordError);
  folder_.write("passwords", "broken\n");
  EXPECT_THROW((void)setPassword(path_, "anna", "secret"), PasswordError);
  EXPECT_EQ(text(), "broken\n");
}

TEST_F(PasswordFile, IsReadOnlyIfItIsSecret) {
  EXPECT_THROW((void)Passwords::read(path_), PasswordError);
  const std::string line = "anna:" + sha512() + "\n";
  for (const unsigned open : {0644U, 0604U, 0620U, 0602U, 0601U}) {
    folder_.write("passwords", line, open);
    EXPECT_THROW((void)Passwords::read(path_), PasswordError) << std::oct << open;
  }
  folder_.write("passwords", line, 0640);
  EXPECT_EQ(Passwords::read(path_).hashes().size(), 1U);
  EXPECT_THROW((void)Passwords::read("/dev/null"), PasswordError);
  EXPECT_THROW((void)Passwords::read("/"), PasswordError);
}

TEST_F(PasswordFile, IsChangedByOneAfterTheOther) {
  std::vector<std::thread> changing;
  for (const char* user : {"anna", "berta", "clara", "dora"}) {
    changing.emplace_back([this, user] { setPassword(path_, user, "secret"); });
  }
  for (std::thread& thread : changing) {
    thread.join();
  }
  EXPECT_EQ(Passwords::read(path_).hashes().size(), 4U);
}

}  // namespace
}  // namespace tests
