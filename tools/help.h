// The text of --help: examples first, because that is what most people look for.
#pragma once

#include <CLI/CLI.hpp>
#include <string>

namespace dehaze {

extern const char* const kHelpSummary;

class HelpFormatter : public CLI::Formatter {
 public:
  HelpFormatter();
  std::string make_help(const CLI::App* app, std::string name,
                        CLI::AppFormatMode mode) const override;
  std::string make_option_opts(const CLI::Option* option) const override;
  std::string make_option_desc(const CLI::Option* option) const override;
};

}  // namespace dehaze
