#include "cli/results.h"

#include "cli/console.h"
#include "launcher/baslauncher.h"

void print_result(const settings& set, const std::string& name, short result, const char* source,
                  const char* netlist) {
  if (set.json) {
    console::print("{\"name\":" + json_string(name) + ",\"result\":" + std::to_string(result) +
                   ",\"source\":" + json_string(source) + ",\"netlist\":" + json_string(netlist) +
                   "}\n");
  } else if (result == LA_FOUND) {
    console::print(netlist);
    console::print("\n");
  }
  // Whoever reads the results need not wait for the last of them.
  console::flush();
}

void print_totals(bool ok, int errors, int warnings) {
  console::print(std::string("{\"ok\":") + (ok ? "true" : "false") + ",\"errors\":" +
                 std::to_string(errors) + ",\"warnings\":" + std::to_string(warnings) + "}\n");
}

void tally::add(short result, bool is_built) {
  ++(result == LA_FAILED      ? failed_
     : result == LA_NOT_FOUND ? not_found_
     : is_built               ? built_
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
