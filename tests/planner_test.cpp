// The planner and the decision, without files and processes.
#include "launcher/planner.h"

#include <algorithm>
#include <array>
#include <random>
#include <set>
#include <sstream>

#include "launcher/decision.h"
#include "launcher/rule_index.h"
#include "support.h"

namespace {

/// Plans by the book, for netlists called "d": each rule is the name that it is for, if any, the
/// extension that it reads, and the one that it makes.
struct NaivePlanner {
  static bool same(const std::string& a, const std::string& b) {
    return UT_STR::ICompare(a.c_str(), b.c_str()) == 0;
  }
  /// Tells the rules of the chain behind the extension that it begins with, or those of a loop.
  bool plan(const std::string& wanted) {
    for (std::size_t i = 0; i < rules.size(); ++i) {
      const auto& [only, from, to] = rules[i];
      if (!same(to, wanted)) continue;
      path.push_back(i);
      if (std::count(path.begin(), path.end(), i) > 1) {
        told = "loop";
        for (const std::size_t rule : path) told += " " + std::to_string(rule);
        return true;
      }
      if (only.empty() || same(only, "d")) {
        if (plan(from) || files.contains(from)) {
          if (told.empty()) told = from;
          if (!told.starts_with("loop")) told += " " + std::to_string(i);
          return true;
        }
      }
      path.pop_back();
    }
    return false;
  }

  std::vector<std::array<std::string, 3>> rules;
  std::set<std::string> files;
  std::vector<std::size_t> path;
  std::string told;
};

TEST(Planner, DoesWhatANaivePlannerDoes) {
  std::mt19937 random(20);
  const auto any = [&](const std::vector<std::string>& of) { return of[random() % of.size()]; };
  const std::vector<std::string> exts = {"a", "A", "b", "c", "d", "e", "f", "kbo"};
  for (int i = 0; i < 3000; ++i) {
    NaivePlanner naive;
    DARRAY_LA_RULE_PTR set(3);
    for (auto j = random() % 12; j > 0; --j) {
      naive.rules.push_back({any({"", "", "", "D", "x"}), any(exts), any(exts)});
      set.add(std::make_unique<LA_RULE>(std::to_string(set.count).c_str()));
      set.elements[set.count - 1]->set_netlist_file(
          (naive.rules.back()[0] + "." + naive.rules.back()[1]).c_str());
      set.elements[set.count - 1]->set_target(("." + naive.rules.back()[2]).c_str());
    }
    for (auto j = random() % 4; j > 0; --j) naive.files.insert(any(exts));
    naive.plan("kbo");
    la_plan plan;
    std::string told;
    const auto find_input = [&](const char* ext, la_found_file&) {
      told = ext;
      return naive.files.contains(ext);
    };
    plan_chain(la_rule_index(set), "d", "kbo", find_input, nullptr, plan);
    if (plan.outcome == la_plan::NOTHING) told = "";
    if (plan.outcome == la_plan::LOOP) told = "loop";
    for (const LA_RULE* rule : plan.chain) told += std::string(" ") + rule->rule_name.get();
    for (const int rule : plan.loop) told += " " + std::to_string(rule);
    ASSERT_EQ(told, naive.told) << testing::PrintToString(naive.rules)
                                << testing::PrintToString(naive.files);
  }
}

// From each of five extensions to each of the next layer.
TEST(Planner, ConsidersEachRuleOnce) {
  DARRAY_LA_RULE_PTR set(300);
  for (int i = 0; i < 8 * 25; ++i) {
    set.add(std::make_unique<LA_RULE>("r"));
    LA_RULE& rule = *set.elements[i];
    rule.set_netlist_file((".e" + std::to_string(i / 25 * 10 + i % 5)).c_str());
    rule.set_target((".e" + std::to_string(i / 25 * 10 + 10 + i % 25 / 5)).c_str());
  }
  int looked = 0;
  la_plan plan;
  std::vector<LA_EXPLANATION::CONSIDERED> considered;
  const auto find_input = [&](const char*, la_found_file&) { return ++looked < 0; };
  plan_chain(la_rule_index(set), "d", "e80", find_input, &considered, plan);
  EXPECT_EQ(plan.outcome, la_plan::NOTHING);
  EXPECT_EQ(considered.size(), 7 * 25 + 5);
  EXPECT_EQ(looked, 8 * 5);
}

// Flags: u unsupported, a after a rebuild, f force, i ignore time stamps. Times: of the input, the
// output, d.x, cfg; "-" is a file that is missing, "h" half a file that a failed run has left.
TEST(Decision, FollowsFlagsThenTimeStamps) {
  const char* const names[] = {"unsupported", "up to date",  "skipped",     "",       "forced",
                               "missing",     "out of date", "after a run", "no time"};
  LA_RULE rule("r");
  rule.add_dependency_file(".x");
  rule.add_dependency_file("cfg");
  for (const auto& row : table(R"(
ufi . . . . | unsupported  | what no longer can be made, whatever there is
afi . . . . | after a run  | every step behind one that has run
fi  . . . . | forced
.   5 - . . | missing, d.out
i   5 - . . | missing, d.out
i   9 h . . | out of date, d.out, half
i   9 5 . . | skipped, d.out
.   - 5 . . | no time, d.out
.   9 5 . . | out of date, d.out
.   5 h . . | out of date, d.out, half
.   5 5 5 - | up to date, d.out, /s/d.x, /s/cfg.in
.   4 5 6 6 | out of date, d.out, /s/d.x, newer /s/d.x
.   4 5 - 6 | out of date, d.out, /s/d.x, /s/cfg.in, newer /s/cfg.in
)")) {
    std::istringstream cells(row[0]);
    std::string flags, time;
    cells >> flags;
    std::vector<Port::FileStatus> files;
    while (cells >> time) {
      files.emplace_back().exists = time != "-";
      files.back().time = time == "h" ? INT64_MIN / 2 : std::atoi(time.c_str());
    }
    const auto is = [&](char flag) { return flags.find(flag) != flags.npos; };
    rule.set_netlister(is('u') ? "NOT_SUPPORTED" : "nl");
    const LA_FULLFILE source("/s/d.in");
    std::string asked;
    std::size_t next = 1;
    const la_decision decision =
        decide({rule, is('f'), is('i'), is('a'), source, files[0], "d.out"}, [&](const char* path) {
          asked += std::string(", ") + path;
          return files.at(next++);
        });
    std::string seen = names[decision.what + 3] + asked;
    if (decision.is_output_left_by_failure) seen += ", half";
    if (!decision.newer.path.empty()) seen += ", newer " + decision.newer.path;
    EXPECT_EQ(seen, row[1]) << row[0];
  }
}

}  // namespace
