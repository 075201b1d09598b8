# Puts the project's version into the staged galaxy.yml (-DFILE, -DVERSION):
# the collection's version is the product's.
file(READ "${FILE}" galaxy)
string(REGEX REPLACE "\nversion: [^\n]*" "\nversion: ${VERSION}" galaxy "${galaxy}")
file(WRITE "${FILE}" "${galaxy}")
