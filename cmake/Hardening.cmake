# What makes a fault of ours, or of a library below, hard to exploit in what ships: the tool and the library read files
# that others wrote. Not under a sanitizer, which does more in other ways, and not without optimisation, which the checks
# of library calls need. ZKFPGA_HARDENED says whether it was done.
include(CheckPIESupported)
check_pie_supported(LANGUAGES CXX)

set(ZKFPGA_HARDENED OFF)
if(NOT ZKFPGA_SANITIZE AND NOT CMAKE_BUILD_TYPE STREQUAL "Debug")
  set(ZKFPGA_HARDENED ON)
  # A function whose array on the stack was overrun ends the process in place of returning, and so does a function of
  # the C library that is told to write beyond what the compiler knows to be there.
  target_compile_options(zkfpga_options INTERFACE
    -fstack-protector-strong -U_FORTIFY_SOURCE -D_FORTIFY_SOURCE=2)
  if(WIN32)
    # Loaded at any address, of the whole 64-bit space, which takes a table of relocations; no data is code.
    target_link_options(zkfpga_options INTERFACE
      LINKER:--dynamicbase LINKER:--enable-reloc-section LINKER:--high-entropy-va LINKER:--nxcompat)
    # The checks themselves, which are a library of the compiler there.
    target_link_options(zkfpga_options INTERFACE -fstack-protector-strong)
  else()
    # The addresses of other libraries' functions are all found at the start and can't be written from then on; no stack
    # is code.
    target_link_options(zkfpga_options INTERFACE LINKER:-z,relro LINKER:-z,now LINKER:-z,noexecstack)
  endif()
endif()
