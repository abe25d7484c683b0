# Writes the text file IN into the C++ source OUT as the character array NAME (namespace xal::host).
file(READ ${IN} content)
file(WRITE ${OUT} "// Generated from ${IN}; do not edit.\nnamespace xal::host {\nextern const char ${NAME}[];\nconst char ${NAME}[] = R\"xalembed(${content})xalembed\";\n}\n")
