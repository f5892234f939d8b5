// What every command is given: which board, core and signals, and how to print.
#pragma once

#include <CLI/CLI.hpp>
#include <string>

namespace qor::tool {

/// From the command line, else the environment (QORVIO_CABLE, QORVIO_CORE, QORVIO_SIGNALS), else the qorvio.toml that is
/// nearest: in the working folder or in one above it.
struct Settings {
  std::string cable;  ///< empty: none was given
  std::string core;
  std::string signals;
  bool forceCore = false;  ///< --core counts though the signals file is for another one
  bool share = false;      ///< read cores that other programs read
  std::string log;         ///< where exchanges are written down; empty: nowhere
  bool verbose = false;    ///< exchanges on standard error
  bool json = false;
  bool quiet = false;

  /// Adds the options of all commands. They must not outlive these settings.
  void addOptions(CLI::App& app);

  /// Fills what the command line left empty. Throws WrongUse for an empty environment variable, and for a qorvio.toml that
  /// is malformed, or that other users could have written, or that names files that they could have written: such a file
  /// can start programs.
  void complete();
};

}  // namespace qor::tool
