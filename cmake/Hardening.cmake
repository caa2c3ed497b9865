# What makes a fault harder to use by somebody who found one. The sanitizers' builds go without.
option(QUORL_HARDENED "Compile the product with stack protection and checked library calls" ON)

if(NOT QUORL_SANITIZE AND NOT QUORL_FUZZ)
  # Programs can be loaded anywhere, and what links them to libraries is read-only before main.
  include(CheckPIESupported)
  check_pie_supported()
  add_link_options(-Wl,-z,relro -Wl,-z,now)
endif()

# Called in the folders of the product; tests are not optimised, which the checked calls need.
macro(quorl_harden)
  if(QUORL_HARDENED AND NOT QUORL_SANITIZE AND NOT QUORL_FUZZ AND NOT CMAKE_BUILD_TYPE STREQUAL "Debug")
    add_compile_options(-fstack-protector-strong -U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=2)
  endif()
endmacro()
