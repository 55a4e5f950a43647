# The fuzzing configuration (clang only): everything is built with the sanitizers and the
# coverage instrumentation that libFuzzer steers by; only the fuzz targets link its driver.
if(QV_BUILD_FUZZERS)
  if(NOT CMAKE_CXX_COMPILER_ID STREQUAL "Clang")
    message(FATAL_ERROR "QV_BUILD_FUZZERS needs clang++ (CMAKE_CXX_COMPILER=clang++)")
  endif()
  add_compile_options(-fsanitize=fuzzer-no-link,address,undefined -fno-sanitize-recover=all
                      -fno-omit-frame-pointer -g)
  add_link_options(-fsanitize=address,undefined)
endif()
