# Compile options of every target of the project.
add_library(vetra_options INTERFACE)
target_compile_options(vetra_options INTERFACE
    -Wall -Wextra -Wpedantic -Wshadow -Wconversion
    # Exceptions carry source paths: they start at the source tree, not at the build machine's root.
    -ffile-prefix-map=${PROJECT_SOURCE_DIR}/=
    -ffile-prefix-map=${PROJECT_SOURCE_DIR}/src/=
    # With fused multiply-add a * b + c would have two legal results, and which one a pixel gets
    # would depend on processor level and compiler.
    -ffp-contract=off)
if(VETRA_WERROR)
    target_compile_options(vetra_options INTERFACE -Werror)
endif()
if(VETRA_SANITIZE)
    target_compile_options(vetra_options INTERFACE -fsanitize=${VETRA_SANITIZE}
        -fno-sanitize-recover=all -fno-omit-frame-pointer -g)
    target_link_options(vetra_options INTERFACE -fsanitize=${VETRA_SANITIZE})
endif()
