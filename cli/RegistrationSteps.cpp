#include <cli/RegistrationSteps.h>

#include <algorithm>
#include <array>
#include <cctype>
#include <string_view>

namespace cli {
namespace {

namespace fs = std::filesystem;

constexpr const char* cimNameSpace = "root/cimv2";
constexpr const char* pegasusInteropNameSpace = "root/PG_InterOp";

/// A library, and the file that declares the classes it serves.
struct Library {
  const char* name;
  const char* classes;
};

/// In the order in which the classes need one another.
constexpr std::array<Library, 2> libraries{{
    {"KelvoEndpointProvider", "KELVO_Endpoints.mof"},
    {"SoftwareInventoryProvider", "KELVO_SoftwareInventory.mof"},
}};

fs::path classesOf(const Library& library, const fs::path& schema) {
  return schema / library.classes;
}

fs::path sfcbFile(const Library& library, const fs::path& schema) {
  return schema / "registration" / "sfcb" / (std::string(library.name) + ".reg");
}

fs::path pegasusFile(const Library& library, const fs::path& schema) {
  return schema / "registration" / "pegasus" / (std::string(library.name) + ".mof");
}

Step sfcbStep(const char* program, const Library& library, const fs::path& schema) {
  return {program, {"-n", cimNameSpace, "-r", sfcbFile(library, schema), classesOf(library, schema)}};
}

/// The staged files become the repository, without a question.
Step sfcbRebuild() {
  return {"sfcbrepos", {"-f"}};
}

/// The name that the registration for OpenPegasus gives a library's module.
std::string moduleOf(const Library& library) {
  return std::string(library.name) + "Module";
}

using FileOf = fs::path (*)(const Library&, const fs::path&);

Step pegasusCompile(const char* nameSpace, FileOf fileOf, const fs::path& schema) {
  Step step{"cimmof", {"-n", nameSpace}};
  for (const Library& library : libraries) {
    step.arguments.push_back(fileOf(library, schema));
  }
  return step;
}

bool needsNoQuotes(char character) {
  return std::isalnum(static_cast<unsigned char>(character)) != 0 ||
         std::string_view("/._-+=:,@").find(character) != std::string_view::npos;
}

std::string quoted(const std::string& argument) {
  if (!argument.empty() && std::all_of(argument.begin(), argument.end(), needsNoQuotes)) {
    return argument;
  }
  std::string text = "'";
  for (const char character : argument) {
    text += character == '\'' ? std::string(R"('\'')") : std::string(1, character);
  }
  return text + "'";
}

}  // namespace

std::vector<Step> registrationSteps(ForeignManager manager, const fs::path& schema) {
  std::vector<Step> steps;
  if (manager == ForeignManager::Sfcb) {
    for (const Library& library : libraries) {
      steps.push_back(sfcbStep("sfcbstage", library, schema));
    }
    steps.push_back(sfcbRebuild());
    return steps;
  }
  steps.push_back(pegasusCompile(cimNameSpace, classesOf, schema));
  steps.push_back(pegasusCompile(pegasusInteropNameSpace, pegasusFile, schema));
  for (const Library& library : libraries) {
    steps.push_back({"cimprovider", {"-l", "-m", moduleOf(library)}});
  }
  return steps;
}

std::vector<Step> unregistrationSteps(ForeignManager manager, const fs::path& schema) {
  std::vector<Step> steps;
  for (auto library = libraries.rbegin(); library != libraries.rend(); ++library) {
    steps.push_back(manager == ForeignManager::Sfcb ? sfcbStep("sfcbunstage", *library, schema)
                                                    : Step{"cimprovider", {"-r", "-m", moduleOf(*library)}});
  }
  if (manager == ForeignManager::Sfcb) {
    steps.push_back(sfcbRebuild());
  }
  return steps;
}

std::vector<fs::path> registrationFiles(ForeignManager manager, const fs::path& schema) {
  std::vector<fs::path> files;
  for (const Library& library : libraries) {
    files.push_back(classesOf(library, schema));
    files.push_back(manager == ForeignManager::Sfcb ? sfcbFile(library, schema)
                                                    : pegasusFile(library, schema));
  }
  return files;
}

std::string commandLine(const Step& step) {
  std::string text = quoted(step.program);
  for (const std::string& argument : step.arguments) {
    text += " " + quoted(argument);
  }
  return text;
}

}  // namespace cli
