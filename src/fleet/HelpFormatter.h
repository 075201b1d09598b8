#pragma once

#include <CLI/Formatter.hpp>

#include <string>
#include <vector>

namespace fleet {

// The help of quorvex-survey and its subcommands in plain words: each
// option with the name of its value ("-j, --jobs N") and its default in
// words ("(default 8)"), without the parser's type and range notation.
// Subcommands added after the formatter is set use it too.
class HelpFormatter : public CLI::Formatter {
public:
    // usageForms: the top-level command's forms after its name, one per line
    // ("[options] IDENTITY..."); each subcommand's form follows them.
    explicit HelpFormatter(std::vector<std::string> usageForms);

    std::string make_help(CLI::App const* app, std::string name,
                          CLI::AppFormatMode mode) const override;
    std::string make_usage(CLI::App const* app, std::string name) const override;
    std::string make_option_name(CLI::Option const* option, bool isPositional) const override;
    std::string make_option_opts(CLI::Option const* option) const override;
    std::string make_option_desc(CLI::Option const* option) const override;

private:
    std::vector<std::string> _usageForms;
};

} // namespace fleet
