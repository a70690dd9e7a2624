# The structure check for whoever gets CIM-XML to see: tests and fuzzers, which may be built without each other.
include_guard(GLOBAL)
find_package(EXPAT REQUIRED)
add_library(dsp0203 STATIC ${CMAKE_CURRENT_LIST_DIR}/ContentModel.cpp ${CMAKE_CURRENT_LIST_DIR}/Dsp0203.cpp)
target_include_directories(dsp0203 PUBLIC ${PROJECT_SOURCE_DIR})
target_link_libraries(dsp0203 PRIVATE EXPAT::EXPAT)
