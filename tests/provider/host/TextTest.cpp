// Texts of a machine that are no text: what leaves the providers is valid UTF-8 without control characters,
// because object managers hand it on as it is.
#include <gmock/gmock.h>
#include <stdlib.h>

#include <filesystem>
#include <fstream>
#include <functional>

#include "Host.h"

namespace {

namespace fs = std::filesystem;

using testing::HasSubstr;

/// Whether XML can hold the text: valid UTF-8 without control characters, U+FFFE and U+FFFF.
bool isClean(const std::string& text) {
  for (std::size_t at = 0; at < text.size();) {
    const auto byte = [&](std::size_t offset) {
      return at + offset < text.size() ? static_cast<unsigned char>(text[at + offset]) : 0U;
    };
    const std::size_t length = byte(0) < 0x80    ? 1
                               : byte(0) >= 0xF0 ? 4
                               : byte(0) >= 0xE0 ? 3
                               : byte(0) >= 0xC2 ? 2
                                                 : 0;
    if (length == 0 || byte(0) > 0xF4) {
      return false;
    }
    unsigned int character = length == 1 ? byte(0) : byte(0) & (0x7FU >> length);
    for (std::size_t i = 1; i < length; ++i) {
      if ((byte(i) & 0xC0U) != 0x80) {
        return false;
      }
      character = character << 6U | (byte(i) & 0x3FU);
    }
    if (character < 0x20 || (character >= 0x7F && character < 0xA0) || character == 0xFFFE ||
        character == 0xFFFF || (character >= 0xD800 && character < 0xE000)) {
      return false;
    }
    at += length;
  }
  return true;
}

class HostTexts : public testing::Test {
 protected:
  HostTexts() {
    write("proc/sys/kernel/hostname", "al\xC3pha\x1b[2J\n");
    write("sys/class/dmi/id/bios_vendor", "Nor\xFFvane\x07 \xC2\x85 Inc.\n");
    write("sys/class/dmi/id/bios_version", "2.\xED\xA0\x80 14\t\xEF\xBF\xBF z\n");
    write("sys/class/dmi/id/bios_date", "03/22/2024\n");
    setenv("ORU_SYSTEM_ROOT", root_.c_str(), 1);
    setenv("ORU_LOG_LEVEL", "off", 1);
    unsetenv("ORU_INVENTORY");
  }
  ~HostTexts() override { fs::remove_all(root_); }

  void write(const char* file, const std::string& content) const {
    fs::create_directories((root_ / file).parent_path());
    std::ofstream(root_ / file) << content;
  }

 private:
  static fs::path makeFolder() {
    std::string name = (fs::temp_directory_path() / "swinv-text-XXXXXX").string();
    return mkdtemp(name.data());
  }
  fs::path root_ = makeFolder();
};

TEST_F(HostTexts, AreCleanWhateverTheMachineHas) {
  ASSERT_TRUE(isClean("Gr\xC3\xBC\xC3\x9F \xE2\x82\xAC"));
  ASSERT_FALSE(isClean("a\xC3") || isClean("\x1b") || isClean("\xC2\x85") || isClean("\xED\xA0\x80"));
  tests::HostileCmpi cmpi;
  const host::Host providers(cmpi.broker());
  providers.serveUpcalls(cmpi);
  std::string all;
  std::size_t texts = 0;
  for (const char* className :
       {host::software, host::installed, host::bios, host::computers, host::ports, host::controllers}) {
    for (const host::Object& object : providers.enumerate(host::makePath(cmpi, className)).objects) {
      for (const auto* values : {&object.keys, &object.properties}) {
        for (const auto& [name, value] : *values) {
          EXPECT_TRUE(isClean(value)) << className << "." << name;
          all += name + "=" + value + "\n";
          ++texts;
        }
      }
    }
  }
  EXPECT_GT(texts, 10U);
  EXPECT_THAT(all, HasSubstr("Manufacturer=Nor\xEF\xBF\xBDvane")) << "what can be read of a text is there";
  EXPECT_THAT(all, HasSubstr("VersionString=2.\xEF\xBF\xBD"));
  EXPECT_THAT(all, HasSubstr("Name=al\xEF\xBF\xBDpha [2J"));
}

}  // namespace
