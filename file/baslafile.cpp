#include "file/baslafile.h"

#include <utility>

#include "file/path_parts.h"
#include "file/path_ring.h"
#include "file/path_text.h"
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

}  // namespace

LA_DIR::LA_DIR(la_text unc_host, la_text drive, la_text dir)
    : unc_host(std::move(unc_host)), drive(std::move(drive)), dir(std::move(dir)) {}

unsigned char LA_DIR::set_dir() {
  return set_dir(LA_DIR());
}

unsigned char LA_DIR::set_dir(const char* path) {
  std::optional<la_path_parts> parts =
      la_split_dir(path != nullptr ? la_path_text(path) : la_current_directory());
  if (!parts) return set_dir();
  if (!parts->is_absolute()) {
    la_path_text joined = la_current_directory();
    joined.add("/").add(parts->dir);
    if (!joined.fits()) return set_dir();
    parts->dir = joined.chars();
  }
  *this = LA_DIR(std::move(parts->unc_host), std::move(parts->drive), std::move(parts->dir));
  return 1;
}

unsigned char LA_DIR::set_dir(const LA_DIR& other) {
  *this = other;
  return dir != nullptr;
}

la_path_text LA_DIR::full_name() const {
  la_path_text text;
  if (unc_host != nullptr) {
    text.add("//").add(unc_host);
  } else if (drive != nullptr) {
    text.add(drive).add(":");
  }
  return text.add(dir);
}

const char* LA_DIR::get_dir() const {
  return dir != nullptr ? la_in_ring(full_name(), 1) : nullptr;
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
  std::optional<la_path_parts> parts = la_split_path(path);
  *this = parts && !parts->is_absolute()
              ? LA_FILE(std::move(parts->dir), std::move(parts->name), std::move(parts->ext))
              : LA_FILE(la_text(), la_text(), la_text());
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
  la_path_parts parts;
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
  return head != nullptr ? la_in_ring(la_path_text().add(head), 1) : nullptr;
}

const char* LA_FILE::get_root() const {
  return name != nullptr ? la_in_ring(la_path_text().add(head).add(name), 1) : nullptr;
}

const char* LA_FILE::get_tail() const {
  if (!names_file()) return nullptr;
  la_path_text text;
  append_tail_to(text);
  return la_in_ring(text, 1);
}

const char* LA_FILE::get_file() const {
  if (!names_file()) return nullptr;
  la_path_text text;
  append_to(text);
  return la_in_ring(text, 1);
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
