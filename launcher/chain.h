// Carries out a planned chain, step by step.
#ifndef KESTREL_LAUNCHER_CHAIN_H
#define KESTREL_LAUNCHER_CHAIN_H

#include <functional>
#include <string>
#include <vector>

#include "launcher/build_settings.h"
#include "launcher/explanation.h"
#include "launcher/home.h"
#include "launcher/message.h"
#include "launcher/planner.h"

/// What a chain has come to.
struct la_built_chain {
  bool is_complete = false;  ///< every step was up to date, skipped, or ran well
  std::string netlist;       ///< the last output; empty when the chain is not complete
  bool is_seen = false;      ///< whether the last output was seen to be there
  std::vector<LA_RUN> runs;  ///< the netlisters that were announced
};

/// Asks the host whether a chain may be carried out: its source, then what each step makes.
using la_ask_host = std::function<bool(const std::vector<const char*>& files)>;

/// Decides each step of the chain, and runs the netlisters that are due. home is the current
/// directory, before and after. ask_host may be empty. why may be null; else it gets every step.
/// What goes wrong is reported.
la_built_chain build_chain(const la_found_file& source, const DARRAY_LA_RULE_CONST_PTR& chain,
                           bool top, const la_build_settings& settings, la_home& home,
                           const la_ask_host& ask_host, const la_report& report,
                           LA_EXPLANATION* why);

/// Whether the host has asked for an end; if so, says that the work on this file is not done.
bool is_interrupted(const LA_FULLFILE& file, const la_report& report);

#endif
