#include "cli/relations.h"

namespace {

/// Which kinds can be made from which, in one step or more.
class reachability {
 public:
  explicit reachability(const DARRAY_LA_RULE_PTR& rules) {
    for (const LA_RULE* rule : rules) {
      next_[kind_of(*rule->netlist_file)].insert(kind_of(*rule->target));
    }
  }
  bool leads(const std::string& from, const std::string& to) {
    const auto [known, is_new] = made_.try_emplace(from);
    if (is_new) collect(from, known->second);
    return known->second.contains(to);
  }

 private:
  void collect(const std::string& from, std::set<std::string>& made) {
    std::vector<std::string> rest = {from};
    while (!rest.empty()) {
      const std::string kind = rest.back();
      rest.pop_back();
      for (const std::string& next : next_[kind]) {
        if (made.insert(next).second) rest.push_back(next);
      }
    }
  }

  std::map<std::string, std::set<std::string>> next_;
  std::map<std::string, std::set<std::string>> made_;
};

}  // namespace

std::string kind_of(const LA_FILE& file) {
  std::string kind = std::string(".") + (file.get_ext() != nullptr ? file.get_ext() : "");
  UT_STR::Lower(kind.data());
  return kind;
}

std::vector<relation> relations_of(const LA_RULE_SET& set) {
  std::vector<relation> relations;
  reachability kinds(set.rules);
  // By source, target, and the only name that the rule is for.
  std::map<std::vector<std::string>, const LA_RULE*> used;
  for (const LA_RULE* rule : set.rules) {
    const std::string source = kind_of(*rule->netlist_file);
    const std::string target = kind_of(*rule->target);
    std::string name = rule->netlist_file->get_name() ? rule->netlist_file->get_name() : "";
    UT_STR::Lower(name.data());
    relation to_others;
    for (const std::string& of : {name, std::string()}) {
      const auto earlier = used.find({source, target, of});
      if (earlier != used.end()) to_others.overridden_by = earlier->second;
    }
    used.try_emplace({source, target, name}, rule);
    to_others.is_in_loop = source == target || kinds.leads(target, source);
    to_others.is_useful = target == ".kbo" || kinds.leads(target, ".kbo");
    relations.push_back(to_others);
  }
  return relations;
}
