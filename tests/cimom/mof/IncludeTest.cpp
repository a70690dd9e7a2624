#include <cimom/mof/ClassRepository.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <string>
#include <string_view>

namespace {

using cimom::ClassRepository;
using testing::HasSubstr;

class MofIncludes : public testing::Test {
 protected:
  MofIncludes()
      : folder_(std::filesystem::temp_directory_path() / ("swinv-mof-" + std::to_string(getpid()))) {
    std::filesystem::create_directories(folder_ / "schema" / "part");
  }
  ~MofIncludes() override { std::filesystem::remove_all(folder_); }

  std::filesystem::path write(const std::string& name, std::string_view text) {
    std::ofstream(folder_ / name) << text;
    return folder_ / name;
  }

  static std::string complaint(const std::filesystem::path& file) {
    ClassRepository classes;
    try {
      classes.compileFile(file);
    } catch (const cimom::MofError& error) {
      return error.what();
    }
    return {};
  }

  std::filesystem::path folder_;
};

TEST_F(MofIncludes, areRelativeToTheirFileAndReadOnce) {
  write("schema/part/a.mof", "#pragma include (\"b.mof\")\nclass A : B {};");
  write("schema/part/b.mof", "class B {};");
  const auto top =
      write("schema/top.mof",
            "#pragma include (\"part/a.mof\")\n#pragma include (\"part/../part/b.mof\")\nclass C : A {};");
  ClassRepository classes;
  classes.compileFile(top);
  classes.compileFile(top);
  EXPECT_TRUE(classes.isA("C", "B"));
}

TEST_F(MofIncludes, mayGoInACircleWithoutHarm) {
  write("schema/a.mof", "#pragma include (\"top.mof\")\nclass A {};");
  const auto top = write("schema/top.mof", "#pragma include (\"a.mof\")\nclass B : A {};");
  EXPECT_EQ(complaint(top), "");
}

TEST_F(MofIncludes, stayInTheFolder) {
  write("outside.mof", "class A {};");
  const auto top = write("schema/top.mof", "\n#pragma include (\"../outside.mof\")");
  EXPECT_THAT(complaint(top), HasSubstr("top.mof:2: included file '../outside.mof' lies outside of folder"));
  std::filesystem::create_symlink(folder_ / "outside.mof", folder_ / "schema" / "link.mof");
  EXPECT_THAT(complaint(write("schema/other.mof", "#pragma include (\"link.mof\")")),
              HasSubstr("lies outside"));
}

TEST_F(MofIncludes, sayWhereTheMissingOneIsNamed) {
  const auto top = write("schema/top.mof", "\n\n#pragma include (\"none.mof\")");
  EXPECT_THAT(complaint(top), HasSubstr("top.mof:3: included file 'none.mof' cannot be read: No such file"));
}

TEST_F(MofIncludes, areBoundedInDepth) {
  for (int depth = 0; depth < 20; ++depth)
    write("schema/d" + std::to_string(depth) + ".mof",
          "#pragma include (\"d" + std::to_string(depth + 1) + ".mof\")");
  write("schema/d20.mof", "");
  EXPECT_THAT(complaint(folder_ / "schema" / "d0.mof"), HasSubstr("too deeply"));
}

TEST_F(MofIncludes, namesAFileThatCannotBeRead) {
  EXPECT_THAT(complaint(folder_ / "none.mof"), HasSubstr("none.mof: cannot be read"));
  EXPECT_THAT(complaint(folder_ / "schema"), HasSubstr("schema: cannot be read"));
}

TEST_F(MofIncludes, refuseAHugeFile) {
  const auto file = write("schema/huge.mof", "");
  std::filesystem::resize_file(file, (16U << 20U) + 1);
  EXPECT_THAT(complaint(file), HasSubstr("is larger than 16777216 bytes"));
}

}  // namespace
