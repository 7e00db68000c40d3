#include "host/pm_devkey.h"

#include "host/port_file.h"
#include "host/port_pathlist.h"

PM_DEVKEY::PM_DEVKEY(const char* file_name, PM_PIC* device, unsigned char /*unused*/,
                     unsigned char /*unused*/, unsigned char /*unused*/) {
  std::string below_root = "/data/";
  if (const char* family = device->get_family()) below_root.append(family).append("/");
  below_root += file_name;
  for (const Port::StringBase<char>& root : Port::CvnenvPath::GetInstance()) {
    const std::string path = root.c_str() + below_root;
    if (!Port::File::missing(path.c_str())) {
      location_ = path;
      return;
    }
  }
}
