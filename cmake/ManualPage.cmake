# Makes PAGE of SOURCE by SCDOC, without the date of the build, so that the same source gives the same page.

execute_process(COMMAND ${SCDOC} INPUT_FILE ${SOURCE} OUTPUT_FILE ${PAGE}.made COMMAND_ERROR_IS_FATAL ANY)
file(READ ${PAGE}.made text)
string(REGEX REPLACE "(\n\\.TH \"[^\"]*\" \"[^\"]*\") \"[^\"]*\"" "\\1 \"\"" text "${text}")
file(WRITE ${PAGE} "${text}")
file(REMOVE ${PAGE}.made)
