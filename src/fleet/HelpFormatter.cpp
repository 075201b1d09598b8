#include "fleet/HelpFormatter.h"

#include <CLI/App.hpp>

#include <sstream>

namespace fleet {

namespace {

constexpr char gc_UsageLabel[] = "Usage: ";

// A subcommand's form from its options: "[--from VPD_FOLDER] DIR", "[--json]";
// one made of actions names them: "runs|changes ...".
std::string subcommandForm(CLI::App const& command) {
    std::string form;
    for (CLI::Option const* option : command.get_options()) {
        if (option == command.get_help_ptr()) {
            continue;
        }
        if (option->get_positional()) {
            form += " " + option->get_name(true, false);
        } else {
            std::string const value =
                option->get_type_name().empty() ? "" : " " + option->get_type_name();
            form += " [" + option->get_name() + value + "]";
        }
    }
    std::string actions;
    for (CLI::App const* action : command.get_subcommands({})) {
        actions += (actions.empty() ? " " : "|") + action->get_name();
    }
    return actions.empty() ? form : form + actions + " ...";
}

} // namespace

HelpFormatter::HelpFormatter(std::vector<std::string> usageForms)
    : _usageForms(std::move(usageForms)) {
    label("Positionals", "Arguments");
    column_width(26);
}

// The usage first, where a person looks, then what the command does; its
// footer (the exit statuses) last.
std::string HelpFormatter::make_help(CLI::App const* app, std::string name,
                                     CLI::AppFormatMode mode) const {
    std::string const footer = make_footer(app);
    return make_usage(app, name) + "\n" + app->get_description() + "\n" + make_positionals(app) +
           make_groups(app, mode) + make_subcommands(app, mode) +
           (footer.empty() ? "" : "\n" + footer);
}

std::string HelpFormatter::make_usage(CLI::App const* app, std::string name) const {
    if (app->get_parent() != nullptr) {
        return gc_UsageLabel + name + subcommandForm(*app) + "\n";
    }
    std::ostringstream out;
    std::string label = gc_UsageLabel;
    for (std::string const& form : _usageForms) {
        out << label << name << " " << form << "\n";
        label = std::string(label.size(), ' ');
    }
    for (CLI::App const* command : app->get_subcommands({})) {
        out << label << name << " " << command->get_name() << subcommandForm(*command) << "\n";
    }
    return out.str();
}

std::string HelpFormatter::make_option_name(CLI::Option const* option, bool isPositional) const {
    if (isPositional) {
        return option->get_name(true, false);
    }
    std::string names = option->get_name(false, true);
    for (std::size_t comma = names.find(','); comma != std::string::npos;
         comma = names.find(',', comma + 2)) {
        names.insert(comma + 1, " ");
    }
    return names;
}

std::string HelpFormatter::make_option_opts(CLI::Option const* option) const {
    if (option->get_positional() || option->get_type_size() == 0) {
        return "";
    }
    return " " + option->get_type_name();
}

std::string HelpFormatter::make_option_desc(CLI::Option const* option) const {
    std::string const& byDefault = option->get_default_str();
    if (byDefault.empty() || option->get_type_size() == 0) {
        return option->get_description();
    }
    return option->get_description() + " (default " + byDefault + ")";
}

} // namespace fleet
