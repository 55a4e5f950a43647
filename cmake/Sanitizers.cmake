# The sanitized build instruments every target, tests included, and stops at the first report.
if(QV_SANITIZE)
  add_compile_options(-fsanitize=address,undefined -fno-sanitize-recover=all
                      -fno-omit-frame-pointer -g)
  add_link_options(-fsanitize=address,undefined)
endif()

# The ThreadSanitizer build (its own build directory: it cannot be combined with the above)
# checks the threads of the management client: the receive thread against the callers'.
if(QV_SANITIZE_THREAD)
  if(QV_SANITIZE)
    message(FATAL_ERROR "QV_SANITIZE_THREAD and QV_SANITIZE cannot be combined")
  endif()
  add_compile_options(-fsanitize=thread -fno-omit-frame-pointer -g)
  add_link_options(-fsanitize=thread)
endif()
