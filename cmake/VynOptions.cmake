# Compiler settings shared by every target: warnings, sanitizers and fuzzing instrumentation.

add_compile_options(-Wall -Wextra -Wno-unused-parameter)

if(VYN_SANITIZE)
  string(REPLACE "," ";" _vyn_sanitizers "${VYN_SANITIZE}")
  list(JOIN _vyn_sanitizers "," _vyn_sanitize_list)
  add_compile_options(-fsanitize=${_vyn_sanitize_list} -fno-omit-frame-pointer -fno-sanitize-recover=all)
  add_link_options(-fsanitize=${_vyn_sanitize_list})
  if("thread" IN_LIST _vyn_sanitizers)
    # ThreadSanitizer wants every module built at a real optimisation level.
    add_compile_options(-O1)
  endif()
endif()

if(VYN_BUILD_FUZZ)
  if(NOT CMAKE_CXX_COMPILER_ID MATCHES "Clang")
    message(FATAL_ERROR "Fuzz targets need clang: configure with -DCMAKE_CXX_COMPILER=clang++ -DCMAKE_C_COMPILER=clang")
  endif()
  add_compile_options(-fsanitize=fuzzer-no-link)
  if(NOT VYN_SANITIZE)
    add_compile_options(-fsanitize=address,undefined -fno-omit-frame-pointer)
    add_link_options(-fsanitize=address,undefined)
  endif()
endif()
