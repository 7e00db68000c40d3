#include "launcher/command_line.h"

#include <memory>

#include "host/pm_pic.h"
#include "launcher/baslauncher.h"
#include "rules/baslarules.h"

namespace {

/// A file as an argument: quoted, and not to be taken for an option. Empty when it does not fit.
std::string argument_of(const LA_FULLFILE& file) {
  const char* path = file.get_external_path();
  std::string argument(path != nullptr ? path : "");
  if (argument.starts_with("\"-")) argument.insert(1, "./");
  return argument;
}

const char* template_of(const LA_RULE& rule, bool top) {
  if (top && rule.netlister_top_options != nullptr) return rule.netlister_top_options;
  return rule.netlister_options != nullptr ? rule.netlister_options.get() : "";
}

}  // namespace

void set_keywords(la_command_options& options, const la_build_settings& settings) {
  std::unique_ptr<PM_PIC> device;
  if (settings.part_name != nullptr) {
    device = std::make_unique<PM_PIC>(settings.part_name, 1, PM_PARTNAME_BINDING(0));
  }
  options.set_keyword("part", settings.part_name);
  options.set_keyword("family", device ? device->get_family() : nullptr);
  options.set_keyword("device", device ? device->get_device() : nullptr);
  options.set_keyword("pkg", device ? device->get_package() : nullptr);
  options.set_keyword("speed", device ? device->get_speed() : nullptr);
  options.set_keyword("ignore_locs", settings.ignore_locs);
  options.set_keyword("add_pads", settings.add_pads);
  options.set_keyword("quiet", settings.quiet);
  options.set_keyword("aul", settings.aul);
  const char* directory = settings.output_dir.get_dir();
  options.set_keyword("OUTPUT", directory != nullptr ? directory : "");
  if (settings.libraries.empty()) options.set_keyword("libraries", nullptr);
  for (const la_text& library : settings.libraries) options.add_keyword("libraries", library.get());
}

std::string make_command(const LA_RULE& rule, const LA_FULLFILE& input, const LA_FULLFILE& output,
                         la_command_options& options, bool top, const la_report& report) {
  const std::string infile = argument_of(input);
  const std::string outfile = argument_of(output);
  if (infile.empty() || outfile.empty()) {
    la_launcher_message().issueError("Launcher: The name of %s is too long for a command line.\n",
                                     infile.empty() ? input.get_tail() : output.get_tail());
    ++report.errors;
    return {};
  }
  options.set_file("infile", infile);
  options.set_file("outfile", outfile);

  const char* options_template = template_of(rule, top);
  char expanded[LA_MAX_OPTIONS];
  if (!options.expand(options_template, expanded)) {
    la_launcher_message().issueError("Could not expand option string \"%s\"\n", expanded);
    report.errors += 2;
    return {};
  }
  const std::string start = std::string(rule.netlister ? rule.netlister.get() : "") + " ";
  std::string command = start + expanded;
  const char* netlister = rule.netlister;
  if (!options.keeps_words(start, options_template, command)) {
    la_launcher_message().issueError(
        "Launcher: The name of a file or directory, or a library entry, would change the arguments "
        "of %s, which is therefore not run: %s\n",
        netlister, command.c_str());
  } else if (const auto misplaced = options.misplaced_value(start, options_template)) {
    la_launcher_message().issueError(
        "Launcher: \"%s\" cannot stand between the quotes of the options of %s, which is therefore "
        "not run: %s\n",
        misplaced->value.c_str(), netlister, misplaced->reason.c_str());
  } else {
    return command;
  }
  ++report.errors;
  return {};
}
