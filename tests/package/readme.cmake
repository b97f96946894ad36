# The programs that README.md shows are those that the tests build and run.

file(READ ${README} readme)

function(expect_in_readme what text)
  string(FIND "${readme}" "${text}" place)
  if(place EQUAL -1)
    message(FATAL_ERROR "README.md does not hold ${what}:\n${text}")
  endif()
endfunction()

file(GLOB programs ${PROGRAMS}/migration/*.cpp)
foreach(program IN ITEMS ${PROGRAMS}/consumer/takeover.cpp ${programs})
  file(READ ${program} text)
  expect_in_readme("the text of ${program}" "```cpp\n${text}```")
endforeach()
