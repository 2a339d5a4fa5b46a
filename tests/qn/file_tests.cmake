# Paths, files and folders.
set(QN_FILE_TESTS
)
