#include "cli/graph.h"

namespace {

/// text between quotes, for Graphviz.
std::string quoted(const std::string& text) {
  std::string result = "\"";
  for (const char c : text) {
    if (c == '"' || c == '\\') result += '\\';
    result += c;
  }
  return result + "\"";
}

std::string node(const LA_FILE& file) {
  const char* ext = file.get_ext();
  return quoted(ext != nullptr ? std::string(".") + ext : "(no extension)");
}

}  // namespace

std::string graph_of(const DARRAY_LA_RULE_PTR& rules) {
  std::string text =
      "digraph rules {\n"
      "  rankdir=LR;\n"
      "  node [shape=box, style=rounded, fontname=\"Helvetica\"];\n"
      "  edge [fontname=\"Helvetica\", fontsize=10];\n";
  for (const LA_RULE* rule : rules) {
    std::string label = rule->rule_name.get();
    if (const char* name = rule->netlist_file->get_name()) label.append(" for ").append(name);
    if (rule->netlister != nullptr) label.append("\n").append(rule->netlister.get());
    text += "  " + node(*rule->netlist_file) + " -> " + node(*rule->target) +
            " [label=" + quoted(label) + "];\n";
  }
  return text + "}\n";
}
