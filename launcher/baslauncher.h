// The launcher: turns the name of a netlist into the file that the host program is to read.
#ifndef KESTREL_LAUNCHER_BASLAUNCHER_H
#define KESTREL_LAUNCHER_BASLAUNCHER_H

#include <memory>
#include <string>
#include <vector>

#include "file/baslafile.h"
#include "host/port_process.h"
#include "host/ut_darray.h"
#include "host/ut_str.h"
#include "launcher/explanation.h"

class LA_RULE;
class LA_RULE_SET;
class la_command_options;
class la_rule_index;
using DARRAY_LA_RULE_CONST_PTR = UT_TYPED_DARRAY<const LA_RULE*>;

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
  /// Whether the last find that returned LA_FOUND has seen the file to read. If not, a netlister
  /// was to write it, whose exit code was good.
  bool saw_netlist() const { return netlist_seen; }
  /// Appends search directories, to be searched after those that there are. A relative name is
  /// relative to the current directory of this moment. More than 32767 in all are refused, with an
  /// error message.
  void add_searchpaths(const char** searchpaths, short num_searchpaths);
  /// From now on find adds what it sees and decides to this object, which stays the caller's; null
  /// ends that.
  void explain_to(LA_EXPLANATION* to) { explanation = to; }
  /// The rules, which live as long as the launcher.
  const LA_RULE_SET& rule_set() const { return *rules; }

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
  short find_disabled(const char* name, char* netlist_path);
  short find_enabled(const char* name, char* source_path, char* netlist_path, unsigned char top);
  void find_home();
  bool is_usable(const LA_FULLFILE& given, const char* name);
  /// A file, and what was known of it when it was found.
  struct found_file {
    LA_FULLFILE file;
    Port::FileStatus status;
  };
  struct lookup;
  bool is_interrupted(const LA_FULLFILE& file);
  void find_named(lookup& where);
  short find_native(lookup& where, bool named_kbc, found_file& source, char* netlist_path);
  const char* at_home(const char* path) const;
  Port::FileStatus status_at_home(const char* path) const;
  bool find_file(lookup& where, const char* ext, found_file& found);
  void note(const char* path, LA_EXPLANATION::SIGHTING sighting) const;
  unsigned char find_in_searchpaths(lookup& where, const char* ext, found_file& found);

  short plan_chain(lookup& where, const char* wanted, unsigned char* visited, found_file& source,
                   DARRAY_LA_RULE_CONST_PTR& chain);
  void note(int rule, LA_EXPLANATION::VERDICT verdict) const;
  void note_taken(int rule) const;
  bool find_input(lookup& where, const LA_RULE& rule, found_file& source);
  void report_loop(const unsigned char* visited);

  struct build_step;
  class working_directory;
  struct shared_by_runs;
  short build_chain(const found_file& source, const DARRAY_LA_RULE_CONST_PTR& chain,
                    unsigned char top, char* netlist_path);
  LA_FULLFILE output_of(const LA_FULLFILE& source, const LA_RULE& rule) const;
  LA_FULLFILE input_of(const build_step& step) const;
  void set_options(la_command_options& options) const;
  void decide(build_step& step) const;
  LA_BUILD_DECISION decide_by_dependency_files(build_step& step) const;
  void note(const build_step& step) const;
  bool report_decision(const build_step& step);
  bool run_netlister(const build_step& step, shared_by_runs& shared, unsigned char top);
  void enter_directory(const LA_RULE& rule, const LA_FULLFILE& input, const LA_FULLFILE& output,
                       working_directory& directory) const;
  bool make_command(const LA_RULE& rule, const LA_FULLFILE& input, const LA_FULLFILE& output,
                    la_command_options& options, unsigned char top, std::string& command);
  bool execute(const LA_RULE& rule, const std::string& command);
  void distrust(const char* output, const Port::FileStatus& before);

  la_text part_name;
  std::unique_ptr<LA_DIR> output_dir;
  short num_searchpaths;
  std::unique_ptr<std::unique_ptr<LA_DIR>[]> searchpaths;
  short num_libraries;
  std::unique_ptr<la_text[]> libraries;
  unsigned char force;
  unsigned char ignore_timestamps;
  la_text ignore_locs;
  la_text add_pads;
  la_text quiet;
  la_text aul;
  unsigned char named_found = 0;
  bool netlist_seen = false;
  found_file named_file;
  /// Where this find looks for its name in the search directories; none before that is needed. Kept
  /// for the sake of its memory.
  std::vector<LA_FULLROOT> in_searchpaths;
  LA_DIR home;  ///< the current directory when this find began
  /// Its name, with "/" at its end; empty when it has none that leads to it.
  std::string home_name;
  int home_runs = 0;  ///< the runs before that was seen
  std::unique_ptr<LA_RULE_SET> rules;
  std::unique_ptr<la_rule_index> index;  ///< the rules by their extensions
  LA_EXPLANATION* explanation = nullptr;
};

#endif
