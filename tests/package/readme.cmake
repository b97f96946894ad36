# What README.md shows is what there is: its programs are those that the tests build and run, and its
# summary the one that the tool prints for the examples.

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

file(REMOVE_RECURSE ${OUT})
execute_process(
    COMMAND ${TOOL} migrate --from examples/old --to examples/new --out ${OUT}
            --exclude-oids examples/excluded-oids.txt --withdraw examples/withdraw-oids.txt
    WORKING_DIRECTORY ${SOURCE}
    OUTPUT_VARIABLE printed ERROR_VARIABLE warnings COMMAND_ERROR_IS_FATAL ANY)
string(FIND "${printed}" "\nFile  " begin)
string(FIND "${printed}" "\nWritten and verified: " end)
if(begin EQUAL -1 OR end EQUAL -1)
  message(FATAL_ERROR "No summary from the tool:\n${printed}")
endif()
math(EXPR length "${end} - ${begin}")
string(SUBSTRING "${printed}" ${begin} ${length} summary)
expect_in_readme("the summary that the tool prints" "${summary}")
string(REGEX MATCH "^[^\n]+\n" warning "${warnings}")
expect_in_readme("the tool's first warning" "${warning}")
