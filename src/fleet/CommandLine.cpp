#include "fleet/CommandLine.h"

#include "fleet/HelpFormatter.h"
#include "fleet/OptionSpelling.h"
#include "utility/WholeNumber.h"

#include <CLI/CLI.hpp>

#include <algorithm>
#include <array>
#include <iostream>
#include <iterator>
#include <memory>
#include <set>

namespace fleet {

using report::gc_ProgramName;

namespace {

// The exit statuses, as quorvex-survey(8) gives them in full.
constexpr char gc_ExitStatusHelp[] =
    "Exit status:\n"
    "  0, 4, 8                 every listed partition surveyed, some, none\n"
    "  64                      bad command line (nothing run)\n"
    "  69                      the console's machine listing (--all) failed\n"
    "  73                      an output cannot be written\n"
    "  74                      the run's history could not be recorded\n"
    "  75                      another run uses the result folder\n"
    "  128+N                   ended by signal N: 129 SIGHUP, 130 SIGINT, 141 SIGPIPE,\n"
    "                          143 SIGTERM";

// An option that takes a whole number within limits.
struct WholeNumber {
    char const* names;
    // The value's name in the help.
    char const* valueName;
    char const* what;
    unsigned long long lowest;
    unsigned long long highest;
};

constexpr WholeNumber gc_Jobs{"-j,--jobs", "N", "a whole number", 1, 1024};
constexpr WholeNumber gc_Timeout{"-t,--timeout", "SECONDS", "a whole number of seconds", 0,
                                 31536000};

// What a value of each name takes, in the words of the errors; the numbers'
// words come from their limits.
struct ValueWords {
    char const* valueName;
    // cppcheck-suppress unusedStructMember ; read by valueWords()
    char const* words;
};
constexpr ValueWords gc_TextValues[] = {
    {"FILE", "a file name"}, {"DIR", "a folder name"}, {"VPD_FOLDER", "a folder name"}};

std::string const& versionText() {
    static std::string const text = std::string(gc_ProgramName) + " " + QUORVEX_SURVEY_VERSION;
    return text;
}

std::string numberWords(WholeNumber const& number) {
    return std::string(number.what) + " from " + std::to_string(number.lowest) + " to " +
           std::to_string(number.highest);
}

// "-j/--jobs" of "-j,--jobs": how errors name an option, every spelling of it.
std::string errorName(std::string names) {
    std::replace(names.begin(), names.end(), ',', '/');
    return names;
}

std::string valueWords(std::string const& valueName) {
    std::array<WholeNumber, 2> const numbers{gc_Jobs, gc_Timeout};
    auto const number = std::find_if(numbers.begin(), numbers.end(), [&](WholeNumber const& n) {
        return valueName == n.valueName;
    });
    if (number != numbers.end()) {
        return numberWords(*number);
    }
    auto const text = std::find_if(std::begin(gc_TextValues), std::end(gc_TextValues),
                                   [&](ValueWords const& v) { return valueName == v.valueName; });
    return text == std::end(gc_TextValues) ? "" : text->words;
}

// No identity of the console starts with "-": such a word is an option.
bool isOptionLike(std::string const& word) {
    return word.rfind('-', 0) == 0;
}

// The number in text, or a refusal that says what the option takes.
unsigned long long wholeNumber(WholeNumber const& number, std::string const& text) {
    std::optional<unsigned long long> const value =
        util::wholeNumberWithin(text, number.lowest, number.highest);
    if (!value) {
        throw CLI::ValidationError(errorName(number.names) + " takes " + numberWords(number) +
                                   ", not '" + text + "'");
    }
    return *value;
}

// The parser only splits the words; the number is read here, so that a
// refusal can say what the option takes. Given twice, the last one counts.
template <typename Number>
void addWholeNumber(CLI::App& app, WholeNumber const& number, Number& target,
                    std::string const& description) {
    app.add_option_function<std::string>(
           number.names,
           [&target, number](std::string const& text) {
               target = static_cast<Number>(wholeNumber(number, text));
           },
           description)
        ->type_name(number.valueName)
        ->default_str(std::to_string(target))
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
}

// Whether the run ends with a recap: by default when a person is likely to
// read it (standard error is a terminal and the run is not quiet).
void addRecapOptions(CLI::App& app, Options& options) {
    CLI::Option* const recap = app.add_flag_callback(
        "--recap", [&options] { options.recap = true; },
        "end with a recap on standard error even when it is not a terminal");
    CLI::Option* const noRecap = app.add_flag_callback(
        "--no-recap", [&options] { options.recap = false; }, "no recap, even on a terminal");
    recap->excludes(noRecap);
}

// Where the run is recorded (docs/history.md): a file, or nowhere.
void addHistoryOptions(CLI::App& app, Options& options) {
    CLI::Option* const history = app.add_option("--history", options.historyFile,
                                                "record the run in the history database FILE")
                                     ->type_name("FILE")
                                     ->default_str(options.historyFile)
                                     ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    CLI::Option* const noHistory = app.add_flag_callback(
        "--no-history", [&options] { options.recordHistory = false; },
        "record nothing in the history database");
    history->excludes(noHistory);
}

// The files monitoring and CI dashboards read.
void addMonitoringOptions(CLI::App& app, Options& options) {
    app.add_option("--metrics", options.metricsFile,
                   "write the run's figures for the node exporter's textfile collector to FILE "
                   "(*.prom)")
        ->type_name("FILE")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    app.add_option("--junit", options.junitFile, "write the run as JUnit XML to FILE")
        ->type_name("FILE")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
}

// The survey's options; the report subcommand adds its own.
void addSurveyOptions(CLI::App& app, Options& options) {
    addWholeNumber(app, gc_Jobs, options.jobs,
                   "partitions surveyed at the same time, all machines together");
    addWholeNumber(app, gc_Timeout, options.timeoutSeconds,
                   "time limit of one remote action, 0 for none");
    app.add_option("--summary", options.summaryFile, "write a summary of the run (JSON) to FILE")
        ->type_name("FILE")
        ->multi_option_policy(CLI::MultiOptionPolicy::TakeLast);
    app.add_flag("-q,--quiet", options.quiet, "no progress line, and no recap unless --recap");
    addRecapOptions(app, options);
    app.add_flag("--all", options.all, "every managed machine the console lists");
    app.add_flag("--wait", options.waitForFolder,
                 "wait for another run using the result folder to end, rather than exit 75");
    addHistoryOptions(app, options);
    app.add_option("IDENTITY", options.identities, "a managed machine (type-model_serial)");
    report::addReportOption(app, options.reportFolder);
    report::addStaleAfterOption(app, options.staleAfterRuns);
    addMonitoringOptions(app, options);
}

// The long options app knows, for guessing what a mistyped one meant.
std::vector<std::string> longOptions(CLI::App const& app) {
    std::vector<std::string> known;
    for (CLI::Option const* option : app.get_options()) {
        std::vector<std::string> const& names = option->get_lnames();
        std::transform(names.begin(), names.end(), std::back_inserter(known),
                       [](std::string const& name) { return "--" + name; });
    }
    return known;
}

std::string unknownOption(CLI::App const& app, std::string const& argument) {
    std::string const typed = typedOptionName(argument);
    std::string reason = "unknown option " + typed;
    if (std::optional<std::string> const meant = closestOption(typed, longOptions(app))) {
        reason += ": did you mean " + *meant + "?";
    }
    return reason;
}

// Whatever the parser could not place, an option first: a word after an
// unknown option may only seem out of place because of it. A "--" left over
// only marks the words after it as identities.
void refuseLeftOver(CLI::App const& app) {
    std::vector<std::string> leftOver = app.remaining();
    leftOver.erase(std::remove(leftOver.begin(), leftOver.end(), "--"), leftOver.end());
    auto const option = std::find_if(leftOver.begin(), leftOver.end(), isOptionLike);
    if (option != leftOver.end()) {
        throw CLI::ValidationError(unknownOption(app, *option));
    }
    if (!leftOver.empty()) {
        throw CLI::ValidationError("unexpected argument '" + leftOver.front() + "'");
    }
}

// Whether word comes after "--" on the command line, which makes it an
// identity whatever it looks like.
bool isAfterDoubleDash(std::string const& word, int argc, char const* const* argv) {
    char const* const* const end = argv + argc;
    char const* const* const dashes = std::find(argv + 1, end, std::string("--"));
    return std::find(dashes, end, word) != end;
}

// A word taken as an identity that looks like an option: one after "--" is
// no option to guess a spelling for (not even "--all"); any other (a
// negative number, which the parser places as an argument) is refused as the
// option it looks like.
std::string optionLikeIdentity(CLI::App const& app, std::string const& word, int argc,
                               char const* const* argv) {
    if (isAfterDoubleDash(word, argc, argv)) {
        return "an identity must not start with '-': '" + word +
               "' (after '--' every argument is an identity)";
    }
    return unknownOption(app, word);
}

// What the parser does not check: a survey needs machines, either --all or
// identities, and an identity is neither empty nor like an option.
void checkMachines(CLI::App const& app, Options const& options, int argc, char const* const* argv) {
    std::vector<std::string> const& identities = options.identities;
    auto const option = std::find_if(identities.begin(), identities.end(), isOptionLike);
    if (option != identities.end()) {
        throw CLI::ValidationError(optionLikeIdentity(app, *option, argc, argv));
    }
    if (std::find(identities.begin(), identities.end(), "") != identities.end()) {
        throw CLI::ValidationError("an identity must not be empty");
    }
    if (options.all && !options.identities.empty()) {
        throw CLI::ValidationError(
            "--all and identities exclude each other: give either --all or identities");
    }
    if (!options.all && options.identities.empty()) {
        throw CLI::ValidationError("no machine to survey: give identities (type-model_serial) "
                                   "or --all");
    }
}

// An identity given more than once is surveyed once, at its first place,
// with one warning.
void keepFirstOfEach(ParsedCommandLine& parsed) {
    std::vector<std::string> kept;
    std::set<std::string> seen;
    std::set<std::string> warned;
    for (auto const& identity : parsed.options.identities) {
        if (seen.insert(identity).second) {
            kept.push_back(identity);
        } else if (warned.insert(identity).second) {
            parsed.warnings.push_back(std::string(gc_ProgramName) + ": warning: " + identity +
                                      " given more than once, surveyed once");
        }
    }
    parsed.options.identities = kept;
}

// The command a refusal belongs to: the innermost subcommand named
// ("history runs").
CLI::App const& refusingCommand(CLI::App const& app) {
    std::vector<CLI::App*> const subcommands = app.get_subcommands();
    return subcommands.empty() ? app : refusingCommand(*subcommands.front());
}

// A subcommand's words after the program's name: "history runs".
std::string commandWords(CLI::App const& command) {
    CLI::App const* const parent = command.get_parent();
    if (parent == nullptr || parent->get_parent() == nullptr) {
        return command.get_name();
    }
    return commandWords(*parent) + " " + command.get_name();
}

// The parser runs short of words only at the end of the command line: the
// last word names the option without its value ("--summary", or "-qj" for -j).
std::string missingValue(CLI::App const& command, std::string const& lastArgument,
                         std::string const& parserReason) {
    if (lastArgument.empty()) {
        return parserReason;
    }
    std::string const name = lastArgument.rfind("--", 0) == 0
                                 ? typedOptionName(lastArgument)
                                 : std::string{'-', lastArgument.back()};
    CLI::Option const* const option = command.get_option_no_throw(name);
    if (option == nullptr || option->get_type_size() == 0) {
        return parserReason;
    }
    // --jobs and --stale-after both call their value N; the report says what
    // its N takes.
    std::string const words = option->check_lname("stale-after")
                                  ? report::staleAfterWords()
                                  : valueWords(option->get_type_name());
    return errorName(option->get_name(false, true)) + " needs a value" +
           (words.empty() ? "" : " (" + words + ")");
}

// The reason and where the whole usage is, on one line: the help no longer
// follows, so that the reason stays on the screen.
ParsedCommandLine refused(CLI::App const& app, std::string const& reason) {
    CLI::App const& command = refusingCommand(app);
    std::string const inCommand = &command == &app ? "" : commandWords(command) + ": ";
    std::string const helpCommand =
        std::string(gc_ProgramName) + (&command == &app ? "" : " " + commandWords(command));
    std::cerr << gc_ProgramName << ": " << inCommand << reason << " (try '" << helpCommand
              << " --help')\n";
    ParsedCommandLine parsed;
    parsed.exitStatus = gc_ExitUsage;
    return parsed;
}

// The output options that name a file or folder: what the name is, and where
// it goes.
struct OutputName {
    char const* option;
    char const* what;
    std::string Options::*value;
};
constexpr std::array<OutputName, 5> gc_OutputNames{
    {{"--summary", "a file name", &Options::summaryFile},
     {"--report", "a folder name", &Options::reportFolder},
     {"--history", "a file name", &Options::historyFile},
     {"--metrics", "a file name", &Options::metricsFile},
     {"--junit", "a file name", &Options::junitFile}}};

// An empty name would turn the output off without a word (an unset
// variable in a timer's script, say). The parser takes the next word as the
// value of "--summary=", so that form is looked for in the words themselves.
void refuseEmptyOutputNames(CLI::App const& app, Options const& options, int argc,
                            char const* const* argv) {
    std::vector<std::string> const words(argv + 1, argv + argc);
    for (OutputName const& name : gc_OutputNames) {
        std::string const option = name.option;
        bool const emptyGiven = app.count(option) > 0 && (options.*name.value).empty();
        if (emptyGiven || std::find(words.begin(), words.end(), option + "=") != words.end()) {
            throw CLI::ValidationError(option + " needs " + name.what + ", not an empty value");
        }
    }
}

// The program ends here: --help or --version.
ParsedCommandLine endingWith(std::string const& text) {
    std::cout << text;
    ParsedCommandLine parsed;
    parsed.exitStatus = 0;
    return parsed;
}

// The subcommands, which survey nothing.
struct Subcommands {
    CLI::App const* report;
    CLI::App const* history;
    CLI::App const* estate;
};

// Checks the history subcommand's request. A word left over without an
// action is the action mistyped, which the check names.
// cppcheck-suppress constParameter ; the check completes the request it is given
void readHistoryRequest(CLI::App const& historyCommand, ParsedCommandLine& parsed) {
    CLI::App const& action = refusingCommand(historyCommand);
    if (&action != &historyCommand) {
        refuseLeftOver(action);
    }
    history::checkHistoryRequest(historyCommand, *parsed.historyRequest);
    refuseLeftOver(historyCommand);
}

// Checks the request of the subcommand given, if any, and keeps its request
// alone; false when no subcommand was given.
bool readSubcommand(Subcommands const& subcommands, ParsedCommandLine& parsed) {
    bool const report = subcommands.report->parsed();
    bool const history = subcommands.history->parsed();
    bool const estate = subcommands.estate->parsed();
    if (report) {
        refuseLeftOver(*subcommands.report);
        report::checkReportRequest(*parsed.reportRequest);
    } else if (history) {
        readHistoryRequest(*subcommands.history, parsed);
    } else if (estate) {
        refuseLeftOver(*subcommands.estate);
        estate::checkEstateRequest(*parsed.estateRequest);
    }
    if (!report) {
        parsed.reportRequest.reset();
    }
    if (!history) {
        parsed.historyRequest.reset();
    }
    if (!estate) {
        parsed.estateRequest.reset();
    }
    return report || history || estate;
}

// Reads what app was given; throws CLI::ParseError with the reason in plain
// words when it is refused.
void readCommandLine(CLI::App& app, Subcommands const& subcommands, ParsedCommandLine& parsed,
                     int argc, char const* const* argv) {
    app.parse(argc, argv);
    refuseLeftOver(app);
    if (readSubcommand(subcommands, parsed)) {
        return;
    }
    refuseEmptyOutputNames(app, parsed.options, argc, argv);
    checkMachines(app, parsed.options, argc, argv);
    keepFirstOfEach(parsed);
}

} // namespace

ParsedCommandLine parseCommandLine(int argc, char const* const* argv) {
    ParsedCommandLine parsed;
    CLI::App app{"Surveys the client partitions of the PYLON console's managed machines,\n"
                 "several partitions at a time.",
                 gc_ProgramName};
    app.formatter(std::make_shared<HelpFormatter>(
        std::vector<std::string>{"[options] IDENTITY...", "[options] --all"}));
    // Words the parser does not know are kept for refuseLeftOver(), which
    // names them in plain words with the option most likely meant.
    app.allow_extras();
    app.set_help_flag("-h,--help", "print this help and exit");
    app.set_version_flag("--version", versionText(), "print the version and exit");
    addSurveyOptions(app, parsed.options);
    parsed.reportRequest.emplace();
    parsed.historyRequest.emplace();
    parsed.estateRequest.emplace();
    Subcommands const subcommands{report::addReportSubcommand(app, *parsed.reportRequest),
                                  history::addHistorySubcommand(app, *parsed.historyRequest),
                                  estate::addEstateSubcommand(app, *parsed.estateRequest)};
    // Set after the subcommands are added, which would inherit it.
    app.footer(gc_ExitStatusHelp);
    try {
        readCommandLine(app, subcommands, parsed, argc, argv);
    } catch (CLI::CallForHelp const&) {
        return endingWith(app.help());
    } catch (CLI::CallForVersion const&) {
        return endingWith(versionText() + "\n");
    } catch (CLI::ArgumentMismatch const& error) {
        return refused(app, missingValue(refusingCommand(app), argv[argc - 1], error.what()));
    } catch (CLI::ParseError const& error) {
        return refused(app, error.what());
    }
    return parsed;
}

} // namespace fleet
