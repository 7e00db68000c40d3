#include "file/baslafile.h"

#include <cstring>
#include <string_view>
#include <utility>

#include "host/cvnform.h"
#include "host/port_init.h"
#include "host/port_msgman.h"
#include "host/ut_path.h"

namespace {

const Port::FileInit file_init;
const Port::PathListInit path_list_init;
const CitP::InstanceTableInit instance_table_init;
const CitP::FactoryInit factory_init;
const Port_MsgManInit message_manager_init;

char revision[] = "$Revision: 1.5 $";

Port_MsgManData& message(int line) {
  return Port_MsgManData::createObject("Kestrel", "file/baslafile.cpp", line, revision);
}

constexpr int RING_SIZE = 100;
char la_path_ring[RING_SIZE][LA_MAX_PATH];
int la_path_ring_next = 0;

}  // namespace

/// A path under construction in a fixed buffer. What does not fit makes it unfit; nothing is cut.
class la_path_text {
 public:
  la_path_text() { chars_[0] = '\0'; }
  /// text in the internal form.
  explicit la_path_text(const char* text) : la_path_text() {
    add(text);
    if (std::memchr(chars_, '\\', length_) != nullptr) Port::File::makeunixpath(chars_);
  }

  /// Appends text; null adds nothing.
  la_path_text& add(const char* text) {
    if (text != nullptr) add(text, std::strlen(text));
    return *this;
  }
  la_path_text& add(const char* text, std::size_t length) {
    if (length_ + length >= LA_MAX_PATH) fits_ = false;
    if (!fits_) return *this;
    std::memcpy(chars_ + length_, text, length);
    cut(length_ + length);
    return *this;
  }
  /// Appends "/" when the text does not end with one.
  la_path_text& add_slash() { return length_ > 0 && chars_[length_ - 1] == '/' ? *this : add("/"); }
  /// Shortens the text to length characters.
  void cut(std::size_t length) {
    length_ = length;
    chars_[length] = '\0';
  }

  /// Makes the text unfit.
  void refuse() { fits_ = false; }

  bool fits() const { return fits_; }
  std::size_t length() const { return length_; }
  char* chars() { return chars_; }
  const char* chars() const { return chars_; }
  std::string_view view() const { return {chars_, length_}; }

  /// Takes so many slots of the ring and returns the text, in external form, in the last of them.
  /// A text that does not fit takes none and gives null.
  const char* in_ring(int slots) const {
    if (!fits_) return nullptr;
    char* slot = nullptr;
    for (; slots > 0; --slots) {
      slot = la_path_ring[la_path_ring_next];
      slot[0] = '\0';
      la_path_ring_next = (la_path_ring_next + 1) % RING_SIZE;
    }
    std::memcpy(slot, chars_, length_ + 1);
    UT_PATH::ExternalPath(slot);
    return slot;
  }

 private:
  char chars_[LA_MAX_PATH];
  std::size_t length_ = 0;
  bool fits_ = true;
};

namespace {

/// The current directory as the system gives it; unfit when it cannot be determined.
la_path_text current_directory() {
  char cwd[LA_MAX_PATH];
  Port::File::getcwd(cwd, sizeof cwd);
  la_path_text text;
  if (cwd[0] == '\0') text.refuse();
  return text.add(cwd);
}

/// The parts of a path.
struct path_parts {
  la_text unc_host;
  la_text drive;
  la_text dir;
  la_text name;
  la_text ext;

  bool is_absolute() const { return dir != nullptr && dir[0] == '/'; }
};

/// Splits a directory name into host, drive and directory. False for an empty name, a UNC name
/// without host, and one that does not fit.
bool la_split_dir(la_path_text& text, path_parts& parts) {
  if (text.length() == 0) return false;
  const char* rest = text.chars();
  if (rest[0] == '/' && rest[1] == '/') {
    const char* host = rest + 2;
    const std::size_t length = std::strcspn(host, "/");
    if (length == 0) return false;
    parts.unc_host = la_path_text().add(host, length).chars();
    rest = host + length;
  } else if (UT_STR::IsAlpha(rest[0]) && rest[1] == ':') {
    parts.drive = cvnform("%c", rest[0]);
    rest += 2;
  }
  if (*rest != '\0') {
    text.add_slash();
    parts.dir = rest;
  }
  return text.fits();
}

la_text la_text_of(std::string_view text) {
  return text.empty() ? la_text() : la_text(text.data(), text.size());
}

/// Splits a file name without directory at its last dot.
void la_split_tail(std::string_view tail, path_parts& parts) {
  const std::size_t dot = tail.rfind('.');
  if (dot != tail.npos) parts.ext = la_text_of(tail.substr(dot + 1));
  parts.name = la_text_of(tail.substr(0, dot));
}

/// Splits a path into its parts. False for null, an empty path, one that does not fit, and one
/// whose directory cannot be split.
bool la_split_path(const char* path, path_parts& parts) {
  if (path == nullptr || *path == '\0') return false;
  la_path_text text(path);
  if (!text.fits()) return false;
  const std::size_t tail = text.view().rfind('/') + 1;
  la_split_tail(text.view().substr(tail), parts);
  if (tail == 0) return true;
  text.cut(tail);
  return la_split_dir(text, parts);
}

/// Resolves "./" and "../", wherever they stand. False when "../" would climb above the first
/// directory.
bool resolve_dots(const la_path_text& from, la_path_text& to) {
  for (const char* c = from.chars(); *c != '\0';) {
    if (std::strncmp(c, "../", 3) == 0) {
      for (int slashes = 0; slashes < 2; ++slashes) {
        const char* slash = UT_STR::RFindChar(to.chars(), '/');
        if (slash == nullptr) return false;
        to.cut(static_cast<std::size_t>(slash - to.chars()));
      }
      to.add("/");
      c += 3;
    } else if (std::strncmp(c, "./", 2) == 0) {
      c += 2;
    } else {
      to.add(c++, 1);
    }
  }
  return true;
}

/// Brings a full name into its normal form, where there is one.
void normalise(la_path_text& text) {
  const std::string_view chars = text.view();
  if (chars.find("./") == chars.npos && chars.find('\\') == chars.npos) return;
  la_path_text normal;
  if (text.fits() && resolve_dots(la_path_text(text.chars()), normal)) text = normal;
}

}  // namespace

LA_DIR::LA_DIR(la_text unc_host, la_text drive, la_text dir)
    : unc_host(std::move(unc_host)), drive(std::move(drive)), dir(std::move(dir)) {}

unsigned char LA_DIR::set_dir() {
  return set_dir(LA_DIR());
}

unsigned char LA_DIR::set_dir(const char* path) {
  path_parts parts;
  la_path_text joined;
  if (path != nullptr) {
    la_path_text text(path);
    if (!la_split_dir(text, parts)) return set_dir();
  } else {
    joined = current_directory();
    if (!joined.fits() || !la_split_dir(joined, parts)) return set_dir();
  }
  if (!parts.is_absolute()) {
    joined = current_directory();
    joined.add("/").add(parts.dir);
    if (!joined.fits()) return set_dir();
    parts.dir = joined.chars();
  }
  *this = LA_DIR(std::move(parts.unc_host), std::move(parts.drive), std::move(parts.dir));
  return 1;
}

unsigned char LA_DIR::set_dir(const LA_DIR& other) {
  *this = other;
  return dir != nullptr;
}

void LA_DIR::append_to(la_path_text& text) const {
  if (unc_host != nullptr) {
    text.add("//").add(unc_host);
  } else if (drive != nullptr) {
    text.add(drive).add(":");
  }
  text.add(dir);
}

const char* LA_DIR::get_dir() const {
  if (dir == nullptr) return nullptr;
  la_path_text text;
  append_to(text);
  return text.in_ring(1);
}

unsigned char LA_DIR::match_dir(const char* path) const {
  if (dir == nullptr || path == nullptr) return 0;
  la_path_text text;
  text.add(path).add_slash();
  const char* own = get_dir();
  return text.fits() && own != nullptr &&
         UT_STR::ICompare(UT_PATH::ExternalPath(text.chars()), own) == 0;
}

unsigned char LA_DIR::chdir() const {
  const char* path = get_dir();
  return path != nullptr && Port::File::chdir(path);
}

void LA_DIR::dump() const {
  message(368).issueStatus("LA_DIR dir is .........................................%s\n",
                           dir.get());
}

LA_FILE::LA_FILE(la_text head, la_text name, la_text ext)
    : head(std::move(head)), name(std::move(name)), ext(std::move(ext)) {}

unsigned char LA_FILE::set_file(const char* path) {
  path_parts parts;
  if (!la_split_path(path, parts) || parts.is_absolute()) parts = path_parts();
  head = std::move(parts.dir);
  name = std::move(parts.name);
  ext = std::move(parts.ext);
  return names_file();
}

unsigned char LA_FILE::set_file(const LA_FILE& other) {
  *this = other;
  return names_file();
}

unsigned char LA_FILE::set_part(la_text LA_FILE::*part, const char* text) {
  if (text != nullptr && UT_STR::Len(text) >= LA_MAX_PATH) {
    *this = LA_FILE();
    return 0;
  }
  this->*part = text;
  return this->*part != nullptr;
}

unsigned char LA_FILE::set_name(const char* new_name) {
  return set_part(&LA_FILE::name, new_name);
}

unsigned char LA_FILE::set_ext(const char* new_ext) {
  return set_part(&LA_FILE::ext, new_ext);
}

unsigned char LA_FILE::set_tail(const char* tail) {
  path_parts parts;
  if (tail != nullptr) {
    la_path_text text(tail);
    if (text.fits()) {
      la_split_tail(text.view(), parts);
    } else {
      head = la_text();
    }
  }
  name = std::move(parts.name);
  ext = std::move(parts.ext);
  return names_file();
}

void LA_FILE::append_tail_to(la_path_text& text) const {
  text.add(name);
  if (ext != nullptr) text.add(".").add(ext);
}

void LA_FILE::append_to(la_path_text& text) const {
  text.add(head);
  append_tail_to(text);
}

const char* LA_FILE::get_head() const {
  return head != nullptr ? la_path_text().add(head).in_ring(1) : nullptr;
}

const char* LA_FILE::get_root() const {
  return name != nullptr ? la_path_text().add(head).add(name).in_ring(1) : nullptr;
}

const char* LA_FILE::get_tail() const {
  if (!names_file()) return nullptr;
  la_path_text text;
  append_tail_to(text);
  return text.in_ring(1);
}

const char* LA_FILE::get_file() const {
  if (!names_file()) return nullptr;
  la_path_text text;
  append_to(text);
  return text.in_ring(1);
}

unsigned char LA_FILE::match_name(const char* other) const {
  return name != nullptr && other != nullptr && UT_STR::ICompare(name, other) == 0;
}

unsigned char LA_FILE::match_ext(const char* other) const {
  return ext != nullptr && other != nullptr && UT_STR::ICompare(ext, other) == 0;
}

unsigned char LA_FILE::match_tail(const char* tail) const {
  if (tail == nullptr) return 0;
  const char* own = get_tail();
  return own != nullptr && UT_STR::ICompare(own, tail) == 0;
}

unsigned char LA_FILE::exists() const {
  const char* path = get_file();
  return path != nullptr && Port::File::exist(path);
}

void LA_FILE::dump() const {
  message(664).issueStatus("%s %s %s\n", head.get(), name.get(), ext.get());
}

LA_FULLFILE& LA_FULLFILE::operator=(const LA_FULLFILE& other) {
  set_file(other);
  return *this;
}

unsigned char LA_FULLFILE::set_file() {
  dir.reset();
  file.reset();
  return 0;
}

// The old parts stay alive until a setter returns: its argument may be a text of theirs.

unsigned char LA_FULLFILE::set_file(const char* path) {
  const LA_FULLFILE old(std::move(*this));
  if (!split(path)) return set_file();
  if (!dir) dir = std::make_unique<LA_DIR>(nullptr);
  return settle();
}

unsigned char LA_FULLFILE::set_file(const char* dirname, const char* filename) {
  const LA_FULLFILE old(std::move(*this));
  if (filename != nullptr && !split(filename)) return set_file();
  if (!dir) dir = std::make_unique<LA_DIR>(dirname);
  return settle();
}

unsigned char LA_FULLFILE::set_file(const LA_DIR& directory, const char* filename) {
  const LA_FULLFILE old(std::move(*this));
  if (filename != nullptr && !split(filename)) return set_file();
  if (!dir) dir = std::make_unique<LA_DIR>(directory);
  return settle();
}

unsigned char LA_FULLFILE::set_file(const LA_FULLFILE& other) {
  if (this != &other) {
    dir.reset(other.dir ? new LA_DIR(*other.dir) : nullptr);
    file.reset(other.file ? new LA_FILE(*other.file) : nullptr);
  }
  return complete();
}

/// Sets the file from a name, and the directory when the name is absolute. False when the name
/// cannot be split.
bool LA_FULLFILE::split(const char* filename) {
  path_parts parts;
  if (!la_split_path(filename, parts)) return false;
  if (parts.is_absolute()) {
    dir.reset(new LA_DIR(std::move(parts.unc_host), std::move(parts.drive), std::move(parts.dir)));
  }
  file.reset(new LA_FILE(std::move(parts.dir), std::move(parts.name), std::move(parts.ext)));
  return true;
}

/// Drops a part that holds nothing.
unsigned char LA_FULLFILE::settle() {
  if (!has_dir()) dir.reset();
  if (file && !file->names_file()) file.reset();
  return complete();
}

unsigned char LA_FULLFILE::set_part(la_text LA_FILE::*part, const char* text) {
  if (!file) {
    if (text == nullptr) return 0;
    file = std::make_unique<LA_FILE>();
  }
  const unsigned char set = file->set_part(part, text);
  return set || text == nullptr ? set : set_file();
}

unsigned char LA_FULLFILE::set_name(const char* name) {
  return set_part(&LA_FILE::name, name);
}

unsigned char LA_FULLFILE::set_ext(const char* ext) {
  return set_part(&LA_FILE::ext, ext);
}

unsigned char LA_FULLFILE::set_tail(const char* tail) {
  if (tail != nullptr && UT_STR::Len(tail) >= LA_MAX_PATH) return set_file();
  if (file) return file->set_tail(tail);
  file = std::make_unique<LA_FILE>(tail);
  if (!file->names_file()) file.reset();
  return file != nullptr;
}

const char* LA_FULLFILE::get_fullhead() const {
  if (!has_dir()) return nullptr;
  la_path_text text;
  dir->append_to(text);
  const bool has_head = file && file->head != nullptr;
  return text.add(has_head ? file->head.get() : nullptr).in_ring(has_head ? 3 : 2);
}

const char* LA_FULLFILE::get_fullroot() const {
  if (!has_dir() || !file || file->name == nullptr) return nullptr;
  la_path_text text;
  dir->append_to(text);
  return text.add(file->head).add(file->name).in_ring(3);
}

/// Appends the full name, normalised where that is possible; text is empty.
void LA_FULLFILE::append_full_name_to(la_path_text& text) const {
  dir->append_to(text);
  file->append_to(text);
  normalise(text);
}

const char* LA_FULLFILE::get_fullfile() const {
  if (!complete()) return nullptr;
  la_path_text text;
  append_full_name_to(text);
  return text.in_ring(3);
}

const char* LA_FULLFILE::get_external_path() const {
  if (!complete()) return nullptr;
  la_path_text full;
  append_full_name_to(full);
  Port::File::makeunixpath(full.chars());
  la_path_text below = current_directory();
  Port::File::makeunixpath(below.chars());
  below.add_slash();
  // What is left must not become a full name: "/w//d" is in "/w", and not "/d".
  const bool is_below = below.fits() &&
                        UT_STR::NCompare(full.chars(), below.chars(), below.length()) == 0 &&
                        full.chars()[below.length()] != '/';
  if (!full.fits()) return nullptr;
  la_path_text text;
  return text.add("\"").add(full.chars() + (is_below ? below.length() : 0)).add("\"").in_ring(4);
}

unsigned char LA_FULLFILE::match_fullfile(const char* path) const {
  const char* own = get_fullfile();
  return own != nullptr && path != nullptr && UT_STR::ICompare(own, path) == 0;
}

unsigned char LA_FULLFILE::exists() const {
  const char* path = get_fullfile();
  return path != nullptr && Port::File::exist(path);
}

unsigned char LA_FULLFILE::get_timestamp(__int64& time) const {
  if (!exists()) return 0;
  return Port::File::getdatetime(get_fullfile(), time);
}

void LA_FULLFILE::dump() const {
  if (dir) dir->dump();
  if (file) file->dump();
}

LA_FULLROOT::LA_FULLROOT(const LA_DIR& directory, const char* root) {
  if (directory.dir == nullptr || root == nullptr) return;
  la_path_text text;
  directory.append_to(text);
  text.add(root);
  if (!text.fits()) return;
  room = LA_MAX_PATH - text.length();
  normalise(text);
  length = text.length();
  std::memcpy(chars, text.chars(), length);
}

LA_FULLROOT::LA_FULLROOT(const LA_FULLFILE& file) : LA_FULLROOT(*file.dir, file.get_root()) {}

const char* LA_FULLROOT::with_ext(const char* ext) {
  const std::size_t added = ext != nullptr ? 1 + std::strlen(ext) : 0;
  if (added >= room) return nullptr;
  if (ext != nullptr) {
    chars[length] = '.';
    std::memcpy(chars + length + 1, ext, added - 1);
  }
  chars[length + added] = '\0';
  return UT_PATH::ExternalPath(chars);
}
