#!/bin/sh
# Installs the build, moves the installation, and uses it as hosts and people do: the program of the
# guide for hosts, as C++11 and C++20, by CMake's find_package, by pkg-config, and with the source
# as a folder of its own project; and the command, on an example.
# usage: install.sh SOURCE-DIRECTORY BUILD-DIRECTORY
set -eu
source=$1 build=$2
unset MYCORVANE CORVANE
dir=$(mktemp -d)
trap 'rm -rf "$dir"' EXIT
cd "$dir"

cmake --install "$build" --prefix "$dir/first" >/dev/null
mv first moved
sed -n '/^```cpp$/,/^```$/{/^```/!p}' "$source/docs/embedding.md" | sed '/^}/q' >host.cpp
echo 'LA_DIR copy_of(const LA_DIR& dir) { return dir; }' >>host.cpp
cat >CMakeLists.txt <<END
cmake_minimum_required(VERSION 3.22)
project(host LANGUAGES CXX)
if(SOURCE)
  add_subdirectory(\${SOURCE} kestrel)
else()
  find_package(KestrelLauncher 2.0 REQUIRED)
endif()
foreach(standard 11 20)
  foreach(library kestrel-launcher kestrel-launcher-static)
    add_executable(\${library}-\${standard} host.cpp)
    set_target_properties(\${library}-\${standard} PROPERTIES CXX_STANDARD \${standard})
    target_link_libraries(\${library}-\${standard} KestrelLauncher::\${library})
  endforeach()
endforeach()
END
hosts() { # DIRECTORY: configured there; builds and runs the four programs
  cmake --build "$1" --parallel 2 >log 2>&1 || { cat log; exit 1; }
  for library in kestrel-launcher kestrel-launcher-static; do
    for standard in 11 20; do CORVANE=$2 "$1/$library-$standard"; done
  done
}
cmake -S . -B by-package -DCMAKE_PREFIX_PATH="$dir/moved" >/dev/null
hosts by-package "$dir/moved/share/kestrel-launcher"
by-package/kestrel-launcher-11  # The shared library finds the data beside it.
cmake -S . -B by-folder -DSOURCE="$source" >/dev/null
hosts by-folder "$source"

PKG_CONFIG_PATH=$(dirname "$(find moved -name '*.pc')")
export PKG_CONFIG_PATH
for standard in 11 20; do
  c++ -std=c++$standard $(pkg-config --cflags kestrel-launcher) host.cpp \
    $(pkg-config --libs kestrel-launcher) -o by-pkg-config
  LD_LIBRARY_PATH=$(pkg-config --variable=libdir kestrel-launcher) ./by-pkg-config
done

touch blinky.v
test "$(moved/bin/kestrel-launch -n blinky 2>&1 | tail -1)" = "$dir/blinky.kbo"
