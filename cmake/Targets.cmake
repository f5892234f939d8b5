# Our warnings are errors, and private: a consumer inherits no flag.
function(qor_strict target)
  target_compile_options(${target} PRIVATE -Wall -Wextra -Wpedantic -Wshadow -Wconversion -Werror)
endfunction()

# A shared library with a version and no unresolved symbols, QorVIO::<target> to its users.
function(qor_shared_library target)
  add_library(${target} SHARED ${ARGN})
  add_library(QorVIO::${target} ALIAS ${target})
  qor_strict(${target})
  target_compile_features(${target} PUBLIC cxx_std_17)
  set_target_properties(${target} PROPERTIES VERSION ${PROJECT_VERSION} SOVERSION ${PROJECT_VERSION_MAJOR})
  # Sessions live on in one library while cores and cables of another are in them: none is ever unloaded.
  target_link_options(${target} PRIVATE -Wl,-z,nodelete)
  if(NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
    target_link_options(${target} PRIVATE -Wl,--no-undefined)
  endif()
endfunction()

# Include directories for users within this build; installed, every header is in one folder.
function(qor_include_directories target)
  list(TRANSFORM ARGN PREPEND ${PROJECT_SOURCE_DIR}/ OUTPUT_VARIABLE folders)
  target_include_directories(${target} PUBLIC "$<BUILD_INTERFACE:${folders}>")
endfunction()
