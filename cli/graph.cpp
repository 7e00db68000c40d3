#include "cli/graph.h"

#include <array>

#include "cli/relations.h"
#include "host/base/utf8.h"

namespace {

/// Text between quotes, for Graphviz, which takes "&" for the start of a character's name and wants
/// UTF-8.
std::string quoted(std::string_view text) {
  std::string result = "\"";
  while (!text.empty()) {
    const utf8_character c = first_character(text);
    const std::string_view bytes = text.substr(0, c.bytes);
    text.remove_prefix(c.bytes);
    if (c.code == '\n') {
      result += "\\n";
    } else if (c.code == '&') {
      result += "&amp;";
    } else if (!c.valid || c.code < ' ' || c.code == 0x7F) {
      result += "\uFFFD";
    } else {
      if (c.code == '"' || c.code == '\\') result += '\\';
      result += bytes;
    }
  }
  return result + "\"";
}

/// A path as the name of its file and of the directory.
std::string in_short(const std::string& path) {
  const std::size_t name = path.rfind('/');
  return name == 0 || name == path.npos ? path : path.substr(path.rfind('/', name - 1) + 1);
}

/// The style of the lines of a file of rules. With more files than styles, they begin again.
const char* style_of(std::size_t file) {
  constexpr std::array STYLES = {"solid", "dashed", "dotted", "bold"};
  return STYLES[file % STYLES.size()];
}

std::string edge(const LA_RULE& rule, const char* style, const char* colour) {
  std::string label = rule.rule_name.get();
  if (const char* name = rule.netlist_file->get_name()) label.append(" for ").append(name);
  if (rule.netlister != nullptr) label.append("\n").append(rule.netlister.get());
  return "  " + quoted(kind_of(*rule.netlist_file)) + " -> " + quoted(kind_of(*rule.target)) +
         " [label=" + quoted(label) + ", style=" + style + colour + "];\n";
}

}  // namespace

std::string graph_of(const LA_RULE_SET& set) {
  const std::vector<relation> relations = relations_of(set);
  std::string edges;
  std::string legend;
  int i = 0;
  for (std::size_t file = 0; file < set.files.size(); ++file) {
    legend.append(style_of(file)).append(": ").append(in_short(set.files[file].path)).append("\n");
    for (const int end = i + set.files[file].num_rules; i < end; ++i) {
      const relation& to_others = relations[static_cast<std::size_t>(i)];
      const char* colour = to_others.overridden_by != nullptr ? ", color=grey, fontcolor=grey"
                           : to_others.is_in_loop             ? ", color=red, fontcolor=red"
                                                              : "";
      edges += edge(*set.rules.elements[i], style_of(file), colour);
    }
  }
  return "digraph rules {\n"
         "  rankdir=LR;\n"
         "  node [shape=box, style=rounded, fontname=\"Helvetica\"];\n"
         "  edge [fontname=\"Helvetica\", fontsize=10];\n"
         "  graph [fontname=\"Helvetica\", fontsize=10, label=" +
         quoted(legend) + "];\n" + edges + "}\n";
}
