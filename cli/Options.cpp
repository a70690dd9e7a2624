#include <cli/HelpTexts.h>
#include <cli/OptionRules.h>
#include <cli/OptionValues.h>
#include <cli/Options.h>
#include <cli/Text.h>
#include <cli/UsageError.h>

#include <CLI/CLI.hpp>
#include <algorithm>
#include <array>
#include <memory>
#include <string_view>
#include <utility>

namespace cli {
namespace {

constexpr std::array<Command, 10> commands{
    Command::List,    Command::Names, Command::Get,    Command::Associators, Command::Tree,
    Command::Capture, Command::Serve, Command::Passwd, Command::Register,    Command::Unregister};

/// The arguments as they were typed, before their values are looked at.
struct Raw {
  Options options;
  std::vector<std::string> properties;  ///< each a list
  std::string format;
  std::string inventory;
  std::string systemRoot;
  std::string provider;
  std::string logLevel;
  std::vector<std::string> schema;
  RawServe serve;
  RawRegister registration;
};

/// The options stand in the program, and fall through to it from behind a command: they may stand anywhere.
std::unique_ptr<CLI::App> makeParser(Raw& raw) {
  auto app = std::make_unique<CLI::App>();
  app->set_help_flag("-h,--help");
  app->set_version_flag("--version", "swinv " SWINV_VERSION);
  app->option_defaults()->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
  app->add_option("--format", raw.format);
  app->add_option("--inventory", raw.inventory);
  app->add_option("--system-root", raw.systemRoot);
  app->add_option("--provider", raw.provider);
  app->add_option("--log-level", raw.logLevel);
  app->add_flag("--force", raw.options.force);
  app->add_option("--assoc-class", raw.options.associationClass);
  app->add_option("--result-class", raw.options.resultClass);
  app->add_option("--role", raw.options.role);
  app->add_option("--result-role", raw.options.resultRole);
  app->add_flag("--names", raw.options.namesOnly);
  app->add_option("--property", raw.properties)
      ->allow_extra_args(false)
      ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
  app->add_option("--schema", raw.schema)
      ->allow_extra_args(false)
      ->multi_option_policy(CLI::MultiOptionPolicy::TakeAll);
  addServeOptions(*app, raw.serve);
  addRegisterOptions(*app, raw.registration);
  app->fallthrough();
  app->require_subcommand(0, 1);
  for (const Command command : commands) {
    CLI::App* sub = app->add_subcommand(std::string(commandName(command)));
    if (command == Command::List || command == Command::Names) {
      sub->add_option("CLASS", raw.options.className);
    } else if (command == Command::Get || command == Command::Associators) {
      sub->add_option("OBJECT", raw.options.object);
    } else if (command == Command::Capture) {
      sub->add_option("FILE", raw.options.captureFile);
    } else if (command == Command::Passwd) {
      sub->add_option("FILE", raw.serve.passwd.file);
      sub->add_option("USER", raw.serve.passwd.user);
    }
  }
  return app;
}

std::optional<Command> commandOf(const CLI::App& app) {
  const auto chosen = app.get_subcommands();
  for (const Command command : commands) {
    if (!chosen.empty() && chosen.front()->get_name() == commandName(command)) {
      return command;
    }
  }
  return std::nullopt;
}

template <typename Enum>
Enum choice(const char* option, const std::string& value,
            std::initializer_list<std::pair<std::string_view, Enum>> known) {
  std::string names;
  for (const auto& [name, meaning] : known) {
    if (value == name) {
      return meaning;
    }
    names.append(names.empty() ? "" : ", ").append(name);
  }
  throw UsageError(std::string(option) + " '" + value + "' is none of " + names);
}

/// An empty name would silently mean "any".
void checkNames(const CLI::App& app, const Options& options) {
  for (const auto& [option, name] :
       {std::pair("--assoc-class", &options.associationClass),
        std::pair("--result-class", &options.resultClass), std::pair("--role", &options.role),
        std::pair("--result-role", &options.resultRole)}) {
    if (app.count(option) != 0 && name->empty()) {
      throw UsageError(std::string(option) + " needs a name, and got an empty one");
    }
  }
}

void checkArguments(const Options& options) {
  const bool takesObject = options.command == Command::Get || options.command == Command::Associators;
  if (takesObject && options.object.empty()) {
    throw UsageError("'swinv " + std::string(commandName(options.command)) +
                     "' needs an InstanceID or an object path, as 'swinv names' prints them");
  }
  if (options.command == Command::Capture && options.captureFile.empty()) {
    throw UsageError("'swinv capture' needs a file to write, or - for standard output");
  }
  if (options.command == Command::Passwd) {
    checkPasswd(options.passwd);
  }
  if (options.className.empty()) {
    throw UsageError("the name of the class is empty");
  }
  if (std::any_of(options.properties.begin(), options.properties.end(),
                  [](const std::string& name) { return name.empty(); })) {
    throw UsageError("--property has an empty name in its list");
  }
  if (options.command == Command::Tree && options.format == Format::Csv) {
    throw UsageError("a tree has no csv form; 'swinv tree' knows --format table and json");
  }
}

std::vector<std::string> namesIn(const std::vector<std::string>& lists) {
  std::vector<std::string> names;
  for (const std::string& list : lists) {
    for (std::size_t begin = 0; begin <= list.size();) {
      const std::size_t end = std::min(list.find(',', begin), list.size());
      names.push_back(list.substr(begin, end - begin));
      begin = end + 1;
    }
  }
  return names;
}

Options interpret(const CLI::App& app, Raw raw) {
  const std::optional<Command> command = commandOf(app);
  if (!command) {
    throw UsageError(
        "no command given; there are list, names, get, associators, tree, capture, serve, passwd, register "
        "and "
        "unregister");
  }
  checkThatOptionsApply(app, *command);
  Options options = std::move(raw.options);
  options.command = *command;
  if (app.count("--format") != 0) {
    options.format = choice<Format>("--format", raw.format,
                                    {{"table", Format::Table}, {"json", Format::Json}, {"csv", Format::Csv}});
  }
  if (app.count("--log-level") != 0) {
    options.logLevel =
        choice<LogLevel>("--log-level", raw.logLevel,
                         {{"off", LogLevel::Off}, {"error", LogLevel::Error}, {"trace", LogLevel::Trace}});
  }
  if (*command == Command::Serve && !options.logLevel) {
    options.logLevel = LogLevel::Error;  // nobody watches a server, but somebody reads its log
  }
  options.properties = namesIn(raw.properties);
  options.inventory = fileOption(app, "--inventory", raw.inventory);
  options.systemRoot = fileOption(app, "--system-root", raw.systemRoot);
  options.provider = fileOption(app, "--provider", raw.provider);
  for (const std::string& file : raw.schema) {
    if (file.empty()) {
      throw UsageError("--schema needs a name, and got an empty one");
    }
    options.schema.emplace_back(file);
  }
  options.serve = interpretServe(app, raw.serve);
  options.passwd = raw.serve.passwd;
  if (*command == Command::Register || *command == Command::Unregister) {
    options.registration = interpretRegister(raw.registration, std::string(commandName(*command)));
  }
  checkNames(app, options);
  checkArguments(options);
  return options;
}

CommandLine usageError(std::string_view what, std::optional<Command> command) {
  const std::string help =
      command ? "swinv " + std::string(commandName(*command)) + " --help" : std::string("swinv --help");
  return {std::nullopt, 2, {}, std::string(what) + "\nTry '" + help + "'."};
}

/// Behind this argument nothing is an option.
constexpr std::string_view optionsEnd = "--";

/// Whether an argument that was not expected looks like an option, but stands where there are none. What is
/// an option, and was not expected, can stand nowhere else.
bool standsBehindOptions(const std::vector<std::string>& arguments, const std::string& argument) {
  const auto end = std::find(arguments.begin(), arguments.end(), optionsEnd);
  const std::vector<std::string> options = optionNames();
  const bool isOption =
      std::find(options.begin(), options.end(), argument.substr(0, argument.find('='))) != options.end();
  return end != arguments.end() && (isOption || std::find(arguments.begin(), end, argument) == end);
}

/// What was typed in the place of a command, or beyond the arguments of one.
std::string unexpected(const CLI::App& app, const std::vector<std::string>& arguments) {
  std::vector<std::string> extras = app.remaining(true);
  std::erase(extras, optionsEnd);
  if (extras.empty()) {
    return "an argument was not expected";
  }
  const std::string& first = extras.front();
  if (first.size() > 1 && first.front() == '-' && !standsBehindOptions(arguments, first)) {
    const auto nearest = nearestName(first.substr(0, first.find('=')), optionNames());
    return "there is no option " + first + (nearest ? "; did you mean " + *nearest + "?" : "");
  }
  if (commandOf(app)) {
    return "'" + first + "' is one argument too many";
  }
  std::vector<std::string> names;
  names.reserve(commands.size());
  for (const Command command : commands) {
    names.emplace_back(commandName(command));
  }
  const auto nearest = nearestName(first, names);
  return "there is no command '" + first + "'" + (nearest ? "; did you mean '" + *nearest + "'?" : "");
}

}  // namespace

CommandLine parseCommandLine(const std::vector<std::string>& arguments) {
  Raw raw;
  const std::unique_ptr<CLI::App> app = makeParser(raw);
  try {
    app->parse(std::vector<std::string>(arguments.rbegin(), arguments.rend()));  // it takes them off the back
    return {interpret(*app, std::move(raw)), 0, {}, {}};
  } catch (const CLI::CallForHelp&) {
    return {std::nullopt, 0, std::string(helpText(commandOf(*app))), {}};
  } catch (const CLI::CallForVersion&) {
    if (app->remaining_size(true) != 0) {
      return usageError(unexpected(*app, arguments), commandOf(*app));
    }
    return {std::nullopt, 0, "swinv " SWINV_VERSION "\n", {}};
  } catch (const CLI::ExtrasError&) {
    return usageError(unexpected(*app, arguments), commandOf(*app));
  } catch (const CLI::ParseError& error) {
    return usageError(error.what(), commandOf(*app));
  } catch (const UsageError& error) {
    return usageError(error.what(), commandOf(*app));
  }
}

std::vector<std::string> optionNames() {
  Raw raw;
  const std::unique_ptr<CLI::App> app = makeParser(raw);
  std::vector<std::string> names;
  for (const CLI::Option* option : app->get_options()) {
    for (const std::string& name : option->get_lnames()) {
      names.push_back("--" + name);
    }
  }
  return names;
}

}  // namespace cli
