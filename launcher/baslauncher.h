// The launcher: turns the name of a netlist into the file that the host program is to read.
#ifndef KESTREL_LAUNCHER_BASLAUNCHER_H
#define KESTREL_LAUNCHER_BASLAUNCHER_H

#include <memory>
#include <vector>

#include "file/baslafile.h"
#include "host/port_process.h"
#include "host/ut_str.h"
#include "launcher/explanation.h"

class LA_RULE_SET;
class la_lookup;
struct la_plan;

/// What find returns.
enum : short { LA_FAILED = -1, LA_FOUND = 0, LA_NOT_FOUND = 1 };

/// The longest command-line options that a template may expand to, terminator included.
constexpr int LA_MAX_OPTIONS = 32768;

/// The child process in which a netlister runs: what it writes is shown as status messages.
class La_Port_Process : public Port_Process {
 public:
  /// As Port_Process.
  explicit La_Port_Process(int mode) : Port_Process(mode) {}
  /// Issues text as a status message, with no regard to any "%" in it.
  void Output(const char* text) override;
  /// Tells the message manager.
  void Pause() override;
};

/// One launcher serves any number of find calls, all from one thread. While a netlister runs, the
/// current directory of the process is the netlister's; no two find calls may run at one time in a
/// process, of one launcher or of two. No operation throws.
class LA_LAUNCHER {
 public:
  /// Loads the rules; findings are issued as messages. All arguments are copied.
  ///
  /// part_name: the device part name, or null. searchpaths: the directories in which sources are
  /// looked for, in this order, after the current directory; relative names are relative to the
  /// current directory of this moment; null when num_searchpaths is 0. libraries: values of the
  /// option keyword "libraries"; null when num_libraries is 0. output_dir: where netlisters write;
  /// null for the current directory. user_rules_file: null for none; the extension is urf unless
  /// the name has one. force: run every step, whatever the time stamps say. ignore_timestamps: do
  /// not run a step whose output exists. The last four give the option keywords of their name the
  /// values "-r", "-a", "-quiet" and "-aul".
  LA_LAUNCHER(const char* part_name, const char** searchpaths, short num_searchpaths,
              const char** libraries, short num_libraries, const char* output_dir,
              const char* user_rules_file, unsigned char force, unsigned char ignore_timestamps,
              unsigned char ignore_locs, unsigned char add_pads, unsigned char quiet,
              unsigned char aul);
  LA_LAUNCHER(const LA_LAUNCHER&) = delete;
  LA_LAUNCHER& operator=(const LA_LAUNCHER&) = delete;
  ~LA_LAUNCHER();

  /// Resolves a netlist name: plans the chain of rules that makes its ".kbo" file, and runs the
  /// netlisters that are due; where no chain applies, looks for a .kbo or .kbc file of that name.
  ///
  /// source_path and netlist_path are buffers of at least LA_MAX_PATH characters; they receive the
  /// file at the start of the chain and the file to read. top: non-zero for the top-level netlist,
  /// for which netlisters get their top-level options.
  ///
  /// Returns LA_FOUND; LA_NOT_FOUND when no rule and no file fits; LA_FAILED when an error has
  /// been reported, and errors has grown. In the last two cases both buffers are empty strings.
  ///
  /// Environment variables that switch, with any value: LAUNCHER_DETAIL, when set at construction,
  /// adds messages on why and where; LA_TEST announces commands and starts none, so that the file
  /// to read may not exist; LA_DISABLE looks for the name in lower case in the search directories
  /// and does nothing else: no rules, no messages, and source_path stays empty.
  short find(const char* name, char* source_path, char* netlist_path, unsigned char top);
  /// Appends search directories, to be searched after the present ones. A relative name is
  /// relative to the current directory of this moment. More than 32767 in all are refused, with an
  /// error message.
  void add_searchpaths(const char** searchpaths, short num_searchpaths);
  /// Whether the last find that returned LA_FOUND has seen the file to read. If not, a netlister
  /// was to write it, and ended with a good exit code or was only announced.
  bool saw_netlist() const;
  /// The netlisters that the last find has announced, in their order, and how they ended. Good
  /// until the next find.
  const std::vector<LA_RUN>& last_runs() const;
  /// From now on find adds what it sees and decides to this object, which stays the caller's; null
  /// ends that.
  void explain_to(LA_EXPLANATION* to);
  /// The rules, which live as long as the launcher; null if memory ran out in the constructor.
  const LA_RULE_SET* rule_set() const { return rules.get(); }
  /// From now on find asks, before it looks at the first step of a chain, whether the chain may be
  /// carried out. files are full names: the source, then what each step makes of the one before it,
  /// last the netlist. When the answer is 0, nothing is run, and find returns LA_FAILED; the host
  /// tells its user why. context is handed on; null for may_build ends that. It must not call the
  /// launcher.
  void ask_before_chains(unsigned char (*may_build)(void* context, const char* const* files,
                                                    int count),
                         void* context);

  /// 1 when the rules were loaded and passed their checks.
  unsigned char ok = 0;

 private:
  unsigned char detail = 0;

 public:
  /// What find has reported since construction. Findings on the rules do not count here.
  int errors = 0;
  int warnings = 0;
  /// How many netlisters find has announced since construction.
  int runs = 0;

 private:
  struct la_finding;

  void append_searchpaths(const char** searchpaths, short num_searchpaths);
  short find_disabled(const char* name, char* netlist_path);
  short find_enabled(const char* name, char* source_path, char* netlist_path, unsigned char top);
  Port::FileStatus find_named(const LA_FULLFILE& given, la_lookup& where);
  short carry_out(const la_plan& plan, unsigned char top, char* source_path, char* netlist_path);

  la_text part_name;
  std::unique_ptr<LA_DIR> output_dir;
  short num_searchpaths = 0;
  std::unique_ptr<std::unique_ptr<LA_DIR>[]> searchpaths;
  short num_libraries = 0;
  std::unique_ptr<la_text[]> libraries;
  unsigned char force;
  unsigned char ignore_timestamps;
  la_text ignore_locs;
  la_text add_pads;
  la_text quiet;
  la_text aul;
  unsigned char named_found = 0;
  LA_FULLFILE named_file;
  std::unique_ptr<LA_RULE_SET> rules;
  std::unique_ptr<la_finding> finding;
};

#endif
