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
