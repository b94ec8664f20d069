#pragma once

#include <ostream>
#include <string>

namespace quorvel::vexmap {

/// A place in the source, printed as `Class::Function@file:line`, or `Function@file:line` outside
/// a class. A value; any thread.
class CodeLocation {
public:
    CodeLocation();  // empty names, line -1
    CodeLocation(CodeLocation const& other);
    /// Null names count as empty.
    CodeLocation(char const* file, char const* function, int line);
    CodeLocation(char const* file, char const* class_name, char const* function, int line);
    CodeLocation& operator=(CodeLocation const& other);
    virtual ~CodeLocation();

    std::string Text() const;

private:
    std::string m_sFile;
    std::string m_sClass;
    std::string m_sFunction;
    int m_iLine;
};

std::ostream& operator<<(std::ostream& stream, CodeLocation const& location);

}  // namespace quorvel::vexmap
