# cmake -DINPUT=encodings.tsv -DOUTPUT=registry_data.cpp -P embed_registry.cmake
# Wraps the registry text in a C++ raw string literal.
file(READ ${INPUT} text)
set(content "// Generated from data/encodings.tsv; do not edit.\n")
string(APPEND content "namespace nlssm::refhost {\nextern const char kRegistryText[];\n")
string(APPEND content "const char kRegistryText[] = R\"nlssm_registry(${text})nlssm_registry\";\n}\n")
file(WRITE ${OUTPUT}.tmp "${content}")
file(COPY_FILE ${OUTPUT}.tmp ${OUTPUT} ONLY_IF_DIFFERENT)
file(REMOVE ${OUTPUT}.tmp)
