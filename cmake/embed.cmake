# Turns a text file into a C++ source defining `extern const char* const SYMBOL`.
file(READ ${IN} content)
set(delim "MIRVAE_EMBED")
file(WRITE ${OUT} "extern const char* const ${SYMBOL};\nconst char* const ${SYMBOL} = R\"${delim}(${content})${delim}\";\n")
