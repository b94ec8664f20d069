# Fails when an engine source other than the two arithmetic doors calls the maths library directly:
# all geometry goes through FloatingPoint and Trigonometry.
file(GLOB sources ${SOURCE_DIR}/src/*.cpp ${SOURCE_DIR}/include/vexmap/*.h)
list(FILTER sources EXCLUDE REGEX "/(floating_point|trigonometry)\\.(h|cpp)$")
set(functions "sqrt|cbrt|sin|cos|tan|asin|acos|atan|atan2|sinh|cosh|tanh|asinh|acosh|atanh|hypot|pow|exp|exp2|log|log2|log10|floor|ceil|round|lround|trunc|fmod|remainder|fabs|nearbyint|rint|fma|isnan|isinf|isfinite|isnormal|fpclassify")
set(offenders "")
foreach(source IN LISTS sources)
    file(READ ${source} text)
    string(REGEX REPLACE "//[^\n]*" "" text "${text}")
    # Qualified calls, global ones, and the suffixed C forms; a bare name is a member of the class.
    if(text MATCHES "#include <(cmath|math\\.h)>"
       OR text MATCHES "std::(${functions})[ ]*\\("
       OR text MATCHES "[^A-Za-z_0-9]::(${functions})[ ]*\\("
       OR text MATCHES "[^A-Za-z_0-9:.>](${functions})(f|l)[ ]*\\(")
        list(APPEND offenders ${source})
    endif()
endforeach()
if(offenders)
    message(FATAL_ERROR "direct maths-library calls in: ${offenders}")
endif()
