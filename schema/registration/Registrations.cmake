# The registration of a library for two other object managers, made from the one that swinv itself reads.
#
#   cmake -D REGISTRATION=FILE -D VERSION=1.2.3 -D SFCB=FILE -D PEGASUS=FILE -P Registrations.cmake
#
# What swinv's file has beyond the four entries that all three share is for swinv alone.
cmake_minimum_required(VERSION 3.25)

# entry(SECTION NAME VARIABLE): the value of an entry of a section.
function(entry section name variable)
  if(NOT section MATCHES "\n[ \t]*${name}:[ \t]*([^\n]*[^ \t\n])")
    message(FATAL_ERROR "${REGISTRATION}: a section lacks '${name}:'")
  endif()
  set(${variable} "${CMAKE_MATCH_1}" PARENT_SCOPE)
endfunction()

# instance(CLASS LINE...): a MOF instance, appended to `mof`.
function(instance class)
  list(JOIN ARGN ";\n   " lines)
  set(mof "${mof}\ninstance of ${class} {\n   ${lines};\n};\n" PARENT_SCOPE)
endfunction()

file(READ ${REGISTRATION} text)
string(REGEX REPLACE "(^|\n)[ \t]*[#;][^\n]*" "\\1" text "${text}")
string(REGEX MATCHALL "\\[[^]]+\\][^[]*" sections "${text}")
if(NOT sections)
  message(FATAL_ERROR "${REGISTRATION}: no section")
endif()

get_filename_component(source ${REGISTRATION} NAME)
set(sfcb "# Made from ${source}.\n")
set(mof "// Made from ${source}: for the interop namespace, root/PG_InterOp.\n")

set(capability 0)
foreach(section IN LISTS sections)
  string(REGEX MATCH "^\\[([^]]+)\\]" unused "${section}")
  set(class "${CMAKE_MATCH_1}")
  entry("${section}" provider provider)
  entry("${section}" location location)
  entry("${section}" type type)
  entry("${section}" namespace namespace)

  string(APPEND sfcb "\n[${class}]\n   provider: ${provider}\n   location: ${location}\n"
    "   type: ${type}\n   namespace: ${namespace}\n")

  set(module "${location}Module")
  if(capability EQUAL 0)
    instance(PG_ProviderModule
      "Name = \"${module}\""
      "Vendor = \"Kelvo\""
      "Version = \"${VERSION}\""
      "InterfaceType = \"CMPI\""
      "InterfaceVersion = \"2.0.0\""
      "Location = \"${location}\"")
    instance(PG_Provider
      "ProviderModuleName = \"${module}\""
      "Name = \"${provider}\"")
  endif()
  math(EXPR capability "${capability} + 1")
  string(REPLACE instance 2 types "${type}")
  string(REPLACE association 3 types "${types}")
  string(REGEX REPLACE "[ \t]+" ", " types "${types}")
  string(REGEX REPLACE "[ \t]+" "\", \"" namespaces "${namespace}")
  instance(PG_ProviderCapabilities
    "ProviderModuleName = \"${module}\""
    "ProviderName = \"${provider}\""
    "CapabilityID = \"${capability}\""
    "ClassName = \"${class}\""
    "Namespaces = {\"${namespaces}\"}"
    "ProviderType = {${types}}")
endforeach()

file(WRITE ${SFCB} "${sfcb}")
file(WRITE ${PEGASUS} "${mof}")
