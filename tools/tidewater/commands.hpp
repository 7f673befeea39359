// The subcommands, each in a source of its own.
#pragma once

#include <CLI/CLI.hpp>

namespace tidewater::command {

// Exit statuses: 0 when every line was done, 1 when some lines were not.
inline constexpr int kSomeRefused = 1;
inline constexpr int kUsageError = 2;

// Each registers its subcommand; exit_status is set when it has run.
void add_convert(CLI::App& app, int& exit_status);
void add_line(CLI::App& app, int& exit_status);
void add_magnetic(CLI::App& app, int& exit_status);
void add_factors(CLI::App& app, int& exit_status);
void add_geoid(CLI::App& app, int& exit_status);
void add_systems(CLI::App& app, int& exit_status);
void add_doctor(CLI::App& app, int& exit_status);
void add_documents(CLI::App& app, int& exit_status);

}  // namespace tidewater::command
