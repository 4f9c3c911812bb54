include(CheckCXXCompilerFlag)
check_cxx_compiler_flag(-fcf-protection FWZEL_HAS_CF_PROTECTION)

# own_code(target): the compile options of every target whose code is ours.
#
# Results are single precision and the same on every machine, so products and sums are never fused.
function(own_code target)
  target_compile_features(${target} PUBLIC cxx_std_17)
  target_compile_options(${target} PRIVATE
    -Wall -Wextra -Wpedantic -Wshadow -Wconversion -ffp-contract=off)
  if(FWZEL_DEVELOPER)
    target_compile_options(${target} PRIVATE -Werror)
  endif()
endfunction()

# hardened(target): what is loaded into a process on air, or installed.
#
# A smashed stack, a C library call past the end of an array and a jump to where no function starts end the
# process instead of going on, and what the loader has resolved cannot be written any more. _FORTIFY_SOURCE needs
# optimised code, and the sanitizers bring checks of their own.
function(hardened target)
  target_compile_options(${target} PRIVATE -fstack-protector-strong)
  if(FWZEL_HAS_CF_PROTECTION)
    target_compile_options(${target} PRIVATE -fcf-protection)
  endif()
  if(NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
    target_compile_options(${target} PRIVATE
      "$<$<NOT:$<CONFIG:Debug>>:-U_FORTIFY_SOURCE;-D_FORTIFY_SOURCE=2>")
  endif()
  target_link_options(${target} PRIVATE -Wl,-z,relro -Wl,-z,now)
endfunction()
