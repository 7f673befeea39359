// Options that several subcommands share.
#pragma once

#include <CLI/CLI.hpp>
#include <string>

#include "position_line.hpp"

namespace tidewater::command {

// Adds --format, --hemisphere, --reverse and --order, each name with a prefix ("out-"); for the
// input also --decimal.
void add_angle_options(CLI::App& app, AngleStyle& style, const std::string& prefix,
                       const std::string& group);

// Adds -p, --precision.
void add_precision(CLI::App& app, int& precision, const std::string& help);

}  // namespace tidewater::command
