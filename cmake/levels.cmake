# How wide the processor's registers may be used: the levels of this machine's kind, and the function
# that compiles formulas once for each.
set(levels)
if(CMAKE_SYSTEM_PROCESSOR MATCHES "^(x86_64|AMD64|i[3-6]86)$" AND NOT EMSCRIPTEN)
  set(levels baseline avx2 avx512)
  if(CMAKE_SIZEOF_VOID_P EQUAL 4)
    # Doubles in vector registers: x87 arithmetic gives other figures.
    target_compile_options(tidewater_options INTERFACE -msse2 -mfpmath=sse)
  endif()
elseif(CMAKE_SYSTEM_PROCESSOR MATCHES "^(aarch64|arm64|s390x)$" OR EMSCRIPTEN)
  set(levels baseline)
endif()
set(TIDEWATER_LEVELS "" CACHE STRING "The only level to compile for: baseline; all where empty")
if(TIDEWATER_LEVELS)
  set(levels ${TIDEWATER_LEVELS})
endif()
set(level_definitions)
if(levels)
  list(APPEND level_definitions TIDEWATER_BASELINE_LANES)
endif()
if("avx512" IN_LIST levels)
  list(APPEND level_definitions TIDEWATER_WIDE_LANES)
endif()
set(level_flags_avx2 -mavx2)
set(level_flags_avx512 -mavx512f -mavx512dq -mavx512vl -mavx512bw)
if(CMAKE_SYSTEM_PROCESSOR STREQUAL s390x)
  set(level_flags_baseline -march=z13)
elseif(EMSCRIPTEN)
  set(level_flags_baseline -msimd128)
endif()
if(MINGW)
  # Its stack is not aligned for wide registers.
  list(APPEND level_flags_avx2 -Wa,-muse-unaligned-vector-move)
  list(APPEND level_flags_avx512 -Wa,-muse-unaligned-vector-move)
endif()

# The headers of a folder compiled for each level; the objects' expressions are put in a variable.
function(tidewater_level_objects name folder headers answer)
  set(objects)
  foreach(level IN LISTS levels)
    set(level_sources)
    foreach(header IN LISTS headers)
      string(REPLACE ".hpp" ".cpp" source ${CMAKE_CURRENT_BINARY_DIR}/${level}/${header})
      file(CONFIGURE OUTPUT ${source} CONTENT "#include \"points/run.hpp\"\n#include \"${header}\"\n")
      list(APPEND level_sources ${source})
    endforeach()
    add_library(${name}_${level} OBJECT ${level_sources})
    target_include_directories(${name}_${level} PRIVATE
      ${PROJECT_SOURCE_DIR}/include ${PROJECT_SOURCE_DIR}/src ${folder})
    target_compile_definitions(${name}_${level} PRIVATE
      TIDEWATER_BUILDING TIDEWATER_LEVEL=${level})
    target_compile_options(${name}_${level} PRIVATE
      -ffp-contract=off ${level_flags_${level}} -fno-lto
      # Instructions in an order that keeps two registers' work apart without spilling them: a
      # twentieth quicker.
      $<$<CXX_COMPILER_ID:GNU>:-fno-tree-loop-vectorize;-fschedule-insns;-fsched-pressure;-Wno-psabi>)
    if(TIDEWATER_SANITIZE OR TIDEWATER_FUZZ)
      # Formulas hand nothing on by reference that outlives them, and their many short-lived values
      # make this one check ten times as long to compile as all others together.
      target_compile_options(${name}_${level} PRIVATE -fno-sanitize-address-use-after-scope)
    endif()
    target_link_libraries(${name}_${level} PRIVATE tidewater_options)
    list(APPEND objects $<TARGET_OBJECTS:${name}_${level}>)
  endforeach()
  set(${answer} ${objects} PARENT_SCOPE)
endfunction()
