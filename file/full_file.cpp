// LA_FULLFILE: a directory, and a file in it.
#include <utility>

#include "file/baslafile.h"
#include "file/normal_form.h"
#include "file/path_parts.h"
#include "file/path_ring.h"
#include "file/path_text.h"

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
  std::optional<la_path_parts> parts = la_split_path(filename);
  if (!parts) return false;
  if (parts->is_absolute()) {
    dir.reset(
        new LA_DIR(std::move(parts->unc_host), std::move(parts->drive), std::move(parts->dir)));
  }
  file.reset(new LA_FILE(std::move(parts->dir), std::move(parts->name), std::move(parts->ext)));
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
  if (!file || file->head == nullptr) return la_in_ring(dir->full_name(), 2);
  return la_in_ring(dir->full_name().add(file->head), 3);
}

const char* LA_FULLFILE::get_fullroot() const {
  if (!has_dir() || !file || file->name == nullptr) return nullptr;
  return la_in_ring(dir->full_name().add(file->head).add(file->name), 3);
}

/// The full name, normalised where that is possible.
la_path_text LA_FULLFILE::full_name() const {
  la_path_text text = dir->full_name();
  file->append_to(text);
  la_normalise(text);
  return text;
}

const char* LA_FULLFILE::get_fullfile() const {
  return complete() ? la_in_ring(full_name(), 3) : nullptr;
}

const char* LA_FULLFILE::get_external_path() const {
  if (!complete()) return nullptr;
  const la_path_text full = full_name();
  if (!full.fits()) return nullptr;
  const la_path_text internal(full.chars());
  la_path_text current = la_current_directory();
  current.add_slash();
  std::string_view name = internal.view();
  if (current.fits() && name.starts_with(current.view())) {
    // What is left must not become a full name: "/w//d" is in "/w", and not "/d".
    const std::string_view below = name.substr(current.length());
    if (!below.starts_with('/')) name = below;
  }
  return la_in_ring(la_path_text().add("\"").add(name).add("\""), 4);
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
