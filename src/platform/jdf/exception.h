// The one exception type of the JDF layer.
// Calls that cannot do what they were asked (an enumeration value outside its table, a resource
// slot that is already linked, an element that cannot be created) throw JDFException; lookups that
// find nothing return a null handle instead.
#pragma once

#include <stdexcept>
#include <string>

namespace JDF {

class JDFException : public std::runtime_error {
public:
    explicit JDFException(const std::string& what) : std::runtime_error(what) {}
};

}  // namespace JDF
