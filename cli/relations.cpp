#include "cli/relations.h"

#include <array>
#include <cstdint>
#include <map>

#include "host/base/text_numbers.h"

namespace {

/// A rule as numbers: its source kind, its target kind, and the only name that it is for.
using numbered_rule = std::array<std::size_t, 3>;

/// For each kind, the kinds that rules make from it, or make it from.
using kind_graph = std::vector<std::vector<std::size_t>>;

constexpr std::size_t NONE = SIZE_MAX;

/// Puts a kind, and all that can be reached from it, into a group. Kinds that are in a group stay
/// there and are not passed.
void collect(const kind_graph& graph, std::size_t kind, std::size_t group,
             std::vector<std::size_t>& groups) {
  std::vector<std::size_t> rest;
  const auto add = [&](std::size_t reached) {
    if (groups[reached] != NONE) return;
    groups[reached] = group;
    rest.push_back(reached);
  };
  add(kind);
  while (!rest.empty()) {
    const std::size_t from = rest.back();
    rest.pop_back();
    for (const std::size_t next : graph[from]) add(next);
  }
}

/// All kinds in depth-first post-order: each after its targets, unless they are in a loop with it.
std::vector<std::size_t> in_post_order(const kind_graph& targets) {
  std::vector<std::size_t> done;
  std::vector<std::size_t> tried(targets.size());
  std::vector<bool> entered(targets.size());
  std::vector<std::size_t> path;
  const auto enter = [&](std::size_t kind) {
    if (!entered[kind]) path.push_back(kind);
    entered[kind] = true;
  };
  for (std::size_t start = 0; start < targets.size(); ++start) {
    enter(start);
    while (!path.empty()) {
      const std::size_t kind = path.back();
      if (tried[kind] < targets[kind].size()) {
        enter(targets[kind][tried[kind]++]);
      } else {
        done.push_back(kind);
        path.pop_back();
      }
    }
  }
  return done;
}

/// The loop that each kind is in, by the number of one of its kinds (Kosaraju's algorithm). A kind
/// in no loop is alone in its own.
std::vector<std::size_t> loops_of(const kind_graph& sources, const kind_graph& targets) {
  const std::vector<std::size_t> kinds = in_post_order(targets);
  std::vector<std::size_t> loops(kinds.size(), NONE);
  // In reverse post-order, what leads to a kind and has no loop yet can also be reached from it.
  for (auto kind = kinds.rbegin(); kind != kinds.rend(); ++kind) {
    collect(sources, *kind, *kind, loops);
  }
  return loops;
}

}  // namespace

std::string kind_of(const LA_FILE& file) {
  std::string kind = std::string(".") + (file.get_ext() != nullptr ? file.get_ext() : "");
  UT_STR::Lower(kind.data());
  return kind;
}

std::vector<relation> relations_of(const LA_RULE_SET& set) {
  la_text_numbers<UT_STR::ICompare> kinds;
  la_text_numbers<UT_STR::ICompare> names;
  const std::size_t native = kinds.number_of("kbo");
  const std::size_t any_name = names.number_of(nullptr);
  std::vector<numbered_rule> rules;
  for (const LA_RULE* rule : set.rules) {
    rules.push_back({kinds.number_of(rule->netlist_file->get_ext()),
                     kinds.number_of(rule->target->get_ext()),
                     names.number_of(rule->netlist_file->get_name())});
  }
  kind_graph sources(kinds.count());
  kind_graph targets(kinds.count());
  for (const auto& [source, target, name] : rules) {
    sources[target].push_back(source);
    targets[source].push_back(target);
  }
  const std::vector<std::size_t> loops = loops_of(sources, targets);
  std::vector<std::size_t> useful(kinds.count(), NONE);
  collect(sources, native, native, useful);

  std::vector<relation> relations;
  std::map<numbered_rule, const LA_RULE*> used;
  for (std::size_t i = 0; i < rules.size(); ++i) {
    const auto& [source, target, name] = rules[i];
    const auto for_any = used.find({source, target, any_name});
    const auto [same, is_new] = used.try_emplace(rules[i], set.rules.elements[i]);
    const LA_RULE* earlier = is_new ? nullptr : same->second;
    relations.push_back({for_any != used.end() ? for_any->second : earlier,
                         loops[source] == loops[target], useful[target] != NONE});
  }
  return relations;
}
