# Doxygen reads the headers through this. Copies, moves and comparisons that the compiler generates, and moves without a
# body, have no description of their own: their meaning is that of the language.
s/^.*operator(==|!=|<)\(.*= default;.*$//
s/^ *[A-Za-z_]+\([A-Za-z_]+ const&( other)?\)( noexcept)? = default;$//
s/^ *[A-Za-z_]+& operator=\([A-Za-z_]+( const)?&&?( other)?\)( noexcept)?( = default)?;$//
s/^ *[A-Za-z_]+\([A-Za-z_]+&&( other)?\)( noexcept)?( = default)?;$//
s/^ *(virtual )?~[A-Za-z_]+\(\)( noexcept)?( override)?( = default)?;$//
