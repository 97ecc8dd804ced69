# Builds the static library of lcms2, whose own recipe is for autotools. tools/lib/deps.sh lays it
# into the sources.
cmake_minimum_required(VERSION 3.25)
project(lcms2 LANGUAGES C)

file(GLOB sources src/*.c)
add_library(lcms2 STATIC ${sources})
target_include_directories(lcms2 PRIVATE include src)

install(TARGETS lcms2 ARCHIVE)
install(FILES include/lcms2.h DESTINATION include)
