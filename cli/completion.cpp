#include "cli/completion.h"

#include <string_view>

#include "cli/settings.h"

namespace {

/// What an argument is, by what it is called.
struct argument_kind {
  std::string_view name;
  const char* in_bash;
  const char* in_zsh;
};
constexpr argument_kind KINDS[] = {
    // The launcher takes the names of parts in any case of letters.
    {"PART", R"sh(-W "$(2>/dev/null "$1" --list-parts | tr A-Z a-z)" -- "${word,,}")sh",
     "_kestrel_launch_parts"},
    {"DIR", R"sh(-d -- "$word")sh", "_files -/"},
    {"FILE", R"sh(-f -- "$word")sh", "_files"},
    {"SHELL", R"sh(-W 'bash zsh' -- "$word")sh", "(bash zsh)"},
    {"TEXT", R"sh(-W '' -- "$word")sh", " "},
};

/// The names of an option, with something behind each.
std::string names_of(const option& o, const std::string& separator) {
  return (o.short_name != nullptr ? o.short_name + separator : "") + o.long_name;
}

std::string for_bash() {
  std::string words;
  for (const option& o : all_options()) words += names_of(o, " ") + " ";
  std::string text = R"sh(# Completions of kestrel-launch for bash.
_kestrel_launch() {
  local word=$2 before=$3
  # "--part=x" comes in three pieces.
  [[ $word == = ]] && word=
  [[ $before == = ]] && before=${COMP_WORDS[COMP_CWORD - 2]}
  case $before in
)sh";
  for (const option& o : all_options()) {
    for (const argument_kind& kind : KINDS) {
      if (o.argument == nullptr || kind.name != o.argument) continue;
      text += "    " + names_of(o, " | ") + ") mapfile -t COMPREPLY < <(compgen " + kind.in_bash +
              ") ;;\n";
    }
  }
  return text + R"sh(    *)
      if [[ $word == -* ]]; then
        mapfile -t COMPREPLY < <(compgen -W ')sh" +
         words + R"sh(' -- "$word")
      else
        mapfile -t COMPREPLY < <(compgen -f -- "$word")
      fi ;;
  esac
}
complete -o filenames -F _kestrel_launch kestrel-launch
)sh";
}

/// A text in single quotes and brackets, for _arguments.
std::string escaped(std::string_view text) {
  std::string result;
  for (const char c : text) {
    if (c == '[' || c == ']' || c == ':') result += '\\';
    c == '\'' ? result += "'\\''" : result += c;
  }
  return result;
}

std::string for_zsh() {
  std::string text = R"sh(#compdef kestrel-launch
# Completions of kestrel-launch for zsh.
_kestrel_launch_parts() {
  local -a parts
  parts=(${(f)"$(2>/dev/null _call_program parts $words[1] --list-parts)"})
  compadd -M 'm:{a-zA-Z}={A-Za-z}' -a parts
}
_arguments \
)sh";
  for (const option& o : all_options()) {
    const std::string equals = o.argument != nullptr ? "=" : "";
    const std::string names =
        o.short_name != nullptr ? std::string("{") + o.short_name + "," + o.long_name + equals + "}"
                                : o.long_name + equals;
    text += "  '*'" + names + "'[" + escaped(o.help) + "]";
    for (const argument_kind& kind : KINDS) {
      if (o.argument != nullptr && kind.name == o.argument)
        text += std::string(":") + o.argument + ":" + kind.in_zsh;
    }
    text += "' \\\n";
  }
  return text + "  '*:netlist:_files'\n";
}

}  // namespace

std::string completion_for(const std::string& shell) {
  if (shell == "bash") return for_bash();
  return shell == "zsh" ? for_zsh() : "";
}
