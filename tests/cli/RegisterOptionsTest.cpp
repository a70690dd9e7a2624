#include <cli/Options.h>
#include <cli/RegistrationSteps.h>

#include <gmock/gmock.h>
#include <gtest/gtest.h>

namespace {

using cli::Command;
using cli::ForeignManager;
using cli::Step;
using testing::ElementsAre;
using testing::HasSubstr;

cli::CommandLine parse(std::vector<std::string> arguments) {
  return cli::parseCommandLine(arguments);
}

std::string complaintOf(std::vector<std::string> arguments) {
  const cli::CommandLine line = parse(std::move(arguments));
  EXPECT_FALSE(line.options);
  EXPECT_EQ(line.exitCode, 2);
  return line.standardError;
}

TEST(RegisterOptions, NameAnObjectManager) {
  const auto sfcb = parse({"register", "--for", "sfcb"}).options;
  ASSERT_TRUE(sfcb);
  EXPECT_EQ(sfcb->command, Command::Register);
  EXPECT_EQ(sfcb->registration.manager, ForeignManager::Sfcb);
  EXPECT_FALSE(sfcb->registration.print);
  const auto pegasus = parse({"--print", "unregister", "--for=pegasus"}).options;
  ASSERT_TRUE(pegasus);
  EXPECT_EQ(pegasus->command, Command::Unregister);
  EXPECT_EQ(pegasus->registration.manager, ForeignManager::Pegasus);
  EXPECT_TRUE(pegasus->registration.print);
}

TEST(RegisterOptions, AreWrongWithoutOneThatIsKnown) {
  EXPECT_THAT(complaintOf({"register"}), HasSubstr("'swinv register' needs an object manager: --for sfcb"));
  EXPECT_THAT(complaintOf({"unregister", "--print"}), HasSubstr("'swinv unregister' needs"));
  EXPECT_THAT(complaintOf({"register", "--for", "Pegasus"}), HasSubstr("'Pegasus' is none of sfcb, pegasus"));
  EXPECT_THAT(complaintOf({"register", "--for", "sfcb", "more"}), HasSubstr("one argument too many"));
}

TEST(RegisterOptions, AreOfTheseCommandsAlone) {
  EXPECT_THAT(complaintOf({"list", "--for", "sfcb"}), HasSubstr("'swinv list' takes no --for"));
  EXPECT_THAT(complaintOf({"tree", "--print"}), HasSubstr("'swinv tree' takes no --print"));
  EXPECT_THAT(complaintOf({"register", "--for", "sfcb", "--inventory", "x"}),
              HasSubstr("takes no --inventory"));
}

TEST(RegistrationSteps, ForSfcbStageEachLibraryAndBuildTheRepository) {
  EXPECT_THAT(
      cli::registrationSteps(ForeignManager::Sfcb, "/s"),
      ElementsAre(Step{"sfcbstage",
                       {"-n", "root/cimv2", "-r", "/s/registration/sfcb/KelvoEndpointProvider.reg",
                        "/s/KELVO_Endpoints.mof"}},
                  Step{"sfcbstage",
                       {"-n", "root/cimv2", "-r", "/s/registration/sfcb/SoftwareInventoryProvider.reg",
                        "/s/KELVO_SoftwareInventory.mof"}},
                  Step{"sfcbrepos", {"-f"}}));
}

TEST(RegistrationSteps, ForSfcbAreUndoneBackwards) {
  EXPECT_THAT(
      cli::unregistrationSteps(ForeignManager::Sfcb, "/s"),
      ElementsAre(Step{"sfcbunstage",
                       {"-n", "root/cimv2", "-r", "/s/registration/sfcb/SoftwareInventoryProvider.reg",
                        "/s/KELVO_SoftwareInventory.mof"}},
                  Step{"sfcbunstage",
                       {"-n", "root/cimv2", "-r", "/s/registration/sfcb/KelvoEndpointProvider.reg",
                        "/s/KELVO_Endpoints.mof"}},
                  Step{"sfcbrepos", {"-f"}}));
}

TEST(RegistrationSteps, ForPegasusCompileClassesThenRegistrations) {
  EXPECT_THAT(
      cli::registrationSteps(ForeignManager::Pegasus, "/s"),
      ElementsAre(
          Step{"cimmof", {"-n", "root/cimv2", "/s/KELVO_Endpoints.mof", "/s/KELVO_SoftwareInventory.mof"}},
          Step{"cimmof",
               {"-n", "root/PG_InterOp", "/s/registration/pegasus/KelvoEndpointProvider.mof",
                "/s/registration/pegasus/SoftwareInventoryProvider.mof"}},
          Step{"cimprovider", {"-l", "-m", "KelvoEndpointProviderModule"}},
          Step{"cimprovider", {"-l", "-m", "SoftwareInventoryProviderModule"}}));
  EXPECT_THAT(cli::unregistrationSteps(ForeignManager::Pegasus, "/s"),
              ElementsAre(Step{"cimprovider", {"-r", "-m", "SoftwareInventoryProviderModule"}},
                          Step{"cimprovider", {"-r", "-m", "KelvoEndpointProviderModule"}}));
}

TEST(RegistrationSteps, ReadAsAShellTakesThem) {
  EXPECT_EQ(cli::commandLine({"sfcbrepos", {"-f"}}), "sfcbrepos -f");
  EXPECT_EQ(cli::commandLine({"a", {"b c", "", "it's", "$x", "/p/q-r_1.mof"}}),
            R"(a 'b c' '' 'it'\''s' '$x' /p/q-r_1.mof)");
}

}  // namespace
