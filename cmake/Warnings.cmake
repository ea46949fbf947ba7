# Warnings for every target of the project; errors where FPNAVI_WERROR asks for it.
add_compile_options(-Wall -Wextra -Wconversion -Wshadow)
if(FPNAVI_WERROR)
    add_compile_options(-Werror)
endif()
