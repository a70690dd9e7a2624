// Texts of a machine that are no text: what leaves the providers is valid UTF-8 without control characters,
// because object managers hand it on as it is.
#include <gmock/gmock.h>

#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <functional>

#include "Host.h"

namespace {

namespace fs = std::filesystem;

using testing::HasSubstr;

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
  ASSERT_TRUE(host::isClean("Gr\xC3\xBC\xC3\x9F \xE2\x82\xAC"));
  ASSERT_FALSE(host::isClean("a\xC3") || host::isClean("\x1b") || host::isClean("\xC2\x85") ||
               host::isClean("\xED\xA0\x80"));
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
          EXPECT_TRUE(host::isClean(value)) << className << "." << name;
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
