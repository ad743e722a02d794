# cmake -DREGISTRY=data/encodings.tsv -DREADME=README.md -P readme_encodings.cmake
#
# Rewrites the block between <!-- encodings:begin --> and <!-- encodings:end -->
# in README.md from the encoding registry: the described encodings with their
# numbers, classes and names, then the numbers that describe to an error.
set(begin_mark "<!-- encodings:begin -->")
set(end_mark "<!-- encodings:end -->")
set(class_names "SBCS" "UTF-8/UTF-EBCDIC" "WCS2" "WCS4" "MBCS modal" "MBCS non-modal")

file(STRINGS ${REGISTRY} rows ENCODING UTF-8)
set(table "")
set(no_encoding "")
set(no_converter "")
set(described 0)
foreach(row IN LISTS rows)
  if(row MATCHES "^#" OR row STREQUAL "")
    continue()
  endif()
  string(REPLACE "\t" ";" fields "${row}")
  list(LENGTH fields count)
  if(NOT count EQUAL 16)
    message(FATAL_ERROR "registry row needs 16 tab-separated fields: ${row}")
  endif()
  list(GET fields 0 number)
  list(GET fields 1 name)
  list(GET fields 3 table_set)
  list(GET fields 4 class)
  list(GET fields 5 base)
  list(GET fields 8 converter)
  list(GET fields 15 title)
  if(class STREQUAL "-")
    if(name STREQUAL "-")
      # One line per table set, listing its numbers.
      string(MAKE_C_IDENTIFIER "${table_set}" key)
      if(NOT DEFINED numbers_${key})
        list(APPEND set_keys ${key})
        set(set_name_${key} "${table_set}")
        set(numbers_${key} "${number}")
      else()
        string(APPEND numbers_${key} ", ${number}")
      endif()
    else()
      string(APPEND no_converter "| ${number} | ${name} | `${table_set}` | ${title} |\n")
    endif()
    continue()
  endif()
  math(EXPR described "${described} + 1")
  list(GET class_names ${class} class_name)
  if(base STREQUAL "A")
    set(family "ASCII")
  else()
    set(family "EBCDIC")
  endif()
  string(APPEND table "| ${number} | ${name} | ${class} ${class_name} | ${family} | `${converter}` | ${title} |\n")
endforeach()

foreach(key IN LISTS set_keys)
  string(APPEND no_encoding "| `${set_name_${key}}` | ${numbers_${key}} |\n")
endforeach()

set(block "${begin_mark}
<!-- Generated from data/encodings.tsv by host/tools/readme_encodings.cmake
     (cmake --build <dir> --target nlssm_readme_encodings); do not edit. -->

The reference host (`host/`, target `nlssm_host`) describes ${described} of the
265 encoding numbers through ICU converters, UTF-EBCDIC with its own codec,
and single-byte pages that ICU's data lacks (`table:` converters) through
tables compiled in from the mappings under `data/catalogue/ucm/`.
Embedding the module with it:

```cpp
#include <nlssm/nlssm.h>
#include <nlssm/reference_host.hpp>

auto host = nlssm::refhost::ReferenceHost::start(nlssm::refhost::linked_module());
NLSSMHandle *latin1 = nullptr;
if (host->module() != nullptr && host->create_handle(29, &latin1) == 0) {
  // call operations through latin1's slots
}
host.reset();  // drops every handle, then destroys the module object
```

| number | name | class | family | converter | encoding |
|---:|---|---|---|---|---|
${table}
Numbers that describe to status 0x803fe809 (encoding not supported): those
whose table set names no single encoding,

| table set | numbers |
|---|---|
${no_encoding}
and those whose encoding has no converter (ISCII 806 is stateful in ICU, not a
single-byte page, and no mapping of it is compiled in):

| number | name | table set | encoding |
|---:|---|---|---|
${no_converter}${end_mark}")

file(READ ${README} text)
string(FIND "${text}" "${begin_mark}" begin_at)
string(FIND "${text}" "${end_mark}" end_at)
if(begin_at EQUAL -1 OR end_at EQUAL -1 OR end_at LESS begin_at)
  message(FATAL_ERROR "${README} lacks the ${begin_mark} ... ${end_mark} block")
endif()
string(LENGTH "${end_mark}" end_length)
math(EXPR after_at "${end_at} + ${end_length}")
string(SUBSTRING "${text}" 0 ${begin_at} before)
string(SUBSTRING "${text}" ${after_at} -1 after)
file(WRITE ${README} "${before}${block}${after}")
