// The magnetic subcommand: field and elements of a geomagnetic model at positions given as text.
#pragma once

namespace CLI {
class App;
}

namespace tidewater::tools {

// Registers the subcommand.  Its callback prints, and sets exit_status to 1 on any failure.
void add_magnetic(CLI::App& app, int& exit_status);

}  // namespace tidewater::tools
