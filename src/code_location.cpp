#include "vexmap/code_location.h"

#include "vexmap/log.h"

namespace quorvel::vexmap {
namespace {
std::string Name(char const* text) {
    return text == nullptr ? std::string() : std::string(text);
}
}  // namespace

CodeLocation::CodeLocation() : m_iLine(-1) {}

CodeLocation::CodeLocation(CodeLocation const& other) = default;

CodeLocation::CodeLocation(char const* file, char const* function, int line)
    : m_sFile(Name(file)), m_sFunction(Name(function)), m_iLine(line) {}

CodeLocation::CodeLocation(char const* file, char const* class_name, char const* function, int line)
    : m_sFile(Name(file)), m_sClass(Name(class_name)), m_sFunction(Name(function)), m_iLine(line) {}

CodeLocation& CodeLocation::operator=(CodeLocation const& other) {
    if (this == &other) {
        Log::warn(__LINE__, __FILE__, "CodeLocation::operator=", "Self assignment of %s object\n",
                  "CodeLocation");
        return *this;
    }
    m_sFile = other.m_sFile;
    m_sClass = other.m_sClass;
    m_sFunction = other.m_sFunction;
    m_iLine = other.m_iLine;
    return *this;
}

CodeLocation::~CodeLocation() = default;

std::string CodeLocation::Text() const {
    std::string text;
    if (!m_sClass.empty()) {
        text = m_sClass + "::";
    }
    return text + m_sFunction + "@" + m_sFile + ":" + std::to_string(m_iLine);
}

std::ostream& operator<<(std::ostream& stream, CodeLocation const& location) {
    return stream << location.Text();
}

}  // namespace quorvel::vexmap
