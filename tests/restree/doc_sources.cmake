# The examples of docs/resource-language.md.
set(RESTREE_DOC_TESTS DocumentationExamplesTest.cpp)
set_source_files_properties(DocumentationExamplesTest.cpp PROPERTIES
  COMPILE_DEFINITIONS ZKFPGA_SOURCE_DIR="${PROJECT_SOURCE_DIR}")
