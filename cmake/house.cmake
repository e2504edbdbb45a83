# How the rooms of LAYERS become targets. One object library a room, so that registration objects are always
# linked; `framework` is all of them together.

find_package(PkgConfig REQUIRED)
find_package(Threads REQUIRED)
pkg_check_modules(EXPAT REQUIRED IMPORTED_TARGET expat)
pkg_check_modules(ICU REQUIRED IMPORTED_TARGET icu-uc icu-i18n)
pkg_check_modules(GIO REQUIRED IMPORTED_TARGET gio-2.0 gio-unix-2.0)
pkg_check_modules(CURL REQUIRED IMPORTED_TARGET libcurl)
pkg_check_modules(OPENSSL REQUIRED IMPORTED_TARGET openssl)

find_program(CCACHE ccache)
if(CCACHE)
  set(CMAKE_CXX_COMPILER_LAUNCHER env CCACHE_BASEDIR=${CMAKE_SOURCE_DIR} CCACHE_NOHASHDIR=1 ${CCACHE})
endif()

add_library(house_options INTERFACE)
target_include_directories(house_options INTERFACE ${CMAKE_SOURCE_DIR}/base/frame/source
                                                   ${CMAKE_SOURCE_DIR}/base/frame ${CMAKE_SOURCE_DIR})
target_compile_options(house_options INTERFACE -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Werror)
if(CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
  # The object model has pairs of operations of one name (update, isA, remove); overriding one hides its twin, by design.
  target_compile_options(house_options INTERFACE -Wno-overloaded-virtual)
endif()
if(CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  # The hidden friends of the class declarations are no templates and are meant to be none.
  target_compile_options(house_options INTERFACE -Wno-non-template-friend)
  # g++ 12 sees an overlap in "literal" + std::string where there is none.
  target_compile_options(house_options INTERFACE -Wno-restrict)
endif()
if(CMAKE_BUILD_TYPE STREQUAL "Debug")
  target_compile_options(house_options INTERFACE -g1)
endif()
target_link_libraries(house_options INTERFACE Threads::Threads)

find_program(LLD ld.lld)
if(LLD)
  add_link_options(-fuse-ld=lld)
endif()
if(VELLAMOOR_SANITIZE)
  # The vptr check needs type information of the language at every call; the class declarations do that work here.
  add_compile_options(-fsanitize=${VELLAMOOR_SANITIZE} -fno-sanitize=vptr -fno-sanitize-recover=all
                      -fno-omit-frame-pointer -O1)
  add_link_options(-fsanitize=${VELLAMOOR_SANITIZE})
endif()

# Fills HOUSE_ROOMS with the framework's rooms in their order.
function(house_read_layers)
  file(STRINGS ${CMAKE_SOURCE_DIR}/LAYERS lines REGEX "^[a-z/]+:")
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS ${CMAKE_SOURCE_DIR}/LAYERS)
  set(rooms "")
  foreach(line IN LISTS lines)
    string(REGEX REPLACE ":.*" "" room "${line}")
    if(NOT room MATCHES "^(uploadmanager|tools/)")
      list(APPEND rooms ${room})
    endif()
  endforeach()
  set(HOUSE_ROOMS ${rooms} PARENT_SCOPE)
endfunction()

function(house_room_folder room result)
  if(room MATCHES "^platform/")
    set(${result} ${CMAKE_SOURCE_DIR}/base/frame/${room} PARENT_SCOPE)
  else()
    set(${result} ${CMAKE_SOURCE_DIR}/base/frame/source/${room} PARENT_SCOPE)
  endif()
endfunction()

function(house_add_rooms)
  add_library(framework INTERFACE)
  target_link_libraries(framework INTERFACE house_options PkgConfig::EXPAT PkgConfig::ICU PkgConfig::GIO
                                            PkgConfig::OPENSSL)
  foreach(room IN LISTS HOUSE_ROOMS)
    house_room_folder(${room} folder)
    file(GLOB sources CONFIGURE_DEPENDS ${folder}/*.cpp)
    if(NOT sources)
      continue()
    endif()
    string(REPLACE "/" "_" target room_${room})
    add_library(${target} OBJECT ${sources})
    target_link_libraries(${target} PUBLIC house_options PRIVATE PkgConfig::EXPAT PkgConfig::ICU PkgConfig::GIO)
    target_sources(framework INTERFACE $<TARGET_OBJECTS:${target}>)
  endforeach()
endfunction()

# Every header must compile by itself; `headers_alone` compiles each as a source of its own.
function(house_add_header_check)
  file(GLOB_RECURSE headers CONFIGURE_DEPENDS ${CMAKE_SOURCE_DIR}/base/*.h ${CMAKE_SOURCE_DIR}/uploadmanager/*.h)
  set(sources "")
  foreach(header IN LISTS headers)
    file(RELATIVE_PATH name ${CMAKE_SOURCE_DIR} ${header})
    string(REPLACE "/" "_" flat ${name})
    set(source ${CMAKE_BINARY_DIR}/headers/${flat}.cpp)
    file(CONFIGURE OUTPUT ${source} CONTENT "#include \"${name}\"\n")
    list(APPEND sources ${source})
  endforeach()
  if(sources)
    add_library(headers_alone OBJECT EXCLUDE_FROM_ALL ${sources})
    target_compile_options(headers_alone PRIVATE -fsyntax-only)
    target_link_libraries(headers_alone PRIVATE house_options PkgConfig::EXPAT PkgConfig::ICU PkgConfig::GIO
                                                PkgConfig::CURL)
  endif()
endfunction()

# A test program of the sources in one folder of tests/. Further arguments are libraries.
function(house_add_test_program name folder)
  file(GLOB sources CONFIGURE_DEPENDS ${folder}/*.cpp)
  if(NOT sources)
    return()
  endif()
  add_executable(${name} ${sources})
  target_link_libraries(${name} PRIVATE framework GTest::gtest ${ARGN})
  target_sources(${name} PRIVATE ${CMAKE_SOURCE_DIR}/tests/main.cpp)
  add_test(NAME ${name} COMMAND ${name})
  # A program that runs this long hangs.
  set_tests_properties(${name} PROPERTIES TIMEOUT 600)
endfunction()
