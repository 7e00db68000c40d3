#include "cli/results.h"

#include "cli/console.h"
#include "launcher/baslauncher.h"

void print_result(const settings& set, const resolution& of) {
  if (set.json) {
    std::string line =
        "{\"name\":" + json_string(of.name) + ",\"result\":" + std::to_string(of.result) +
        ",\"source\":" + json_string(of.source) + ",\"netlist\":" + json_string(of.netlist) +
        ",\"built\":" + (of.is_built ? "true" : "false") +
        ",\"warnings\":" + std::to_string(of.warnings);
    if (of.result == LA_FAILED) line += ",\"error\":" + json_string(of.error);
    console::print(line + "}\n");
  } else if (of.result == LA_FOUND) {
    console::print(of.netlist + "\n");
  }
  // Whoever reads the results need not wait for the last of them.
  console::flush();
}

void print_totals(bool ok) {
  console::print(std::string("{\"ok\":") + (ok ? "true" : "false") +
                 ",\"errors\":" + std::to_string(console::count(PORT_MSG_ERROR)) +
                 ",\"warnings\":" + std::to_string(console::count(PORT_MSG_WARNING)) + "}\n");
}

void tally::add(const resolution& next) {
  ++(next.result == LA_FAILED      ? failed_
     : next.result == LA_NOT_FOUND ? not_found_
     : next.is_built               ? built_
                                   : up_to_date_);
}

void tally::tell(std::size_t names, bool is_dry_run) const {
  const int tried = built_ + up_to_date_ + not_found_ + failed_;
  if (names < 2) return;
  std::string text = std::to_string(names) + " names:";
  const struct {
    int number;
    const char* what;
  } counts[] = {{built_, is_dry_run ? "to be built" : "built"},
                {up_to_date_, "up to date"},
                {not_found_, "not found"},
                {failed_, "failed"},
                {static_cast<int>(names) - tried, "not tried"}};
  for (const auto& [number, what] : counts) {
    if (number > 0) text.append(" ").append(std::to_string(number)).append(" ").append(what) += ',';
  }
  text.pop_back();
  complain(text);
}
