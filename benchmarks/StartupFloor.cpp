// The least that a tool of this kind can do: it loads the libraries that it is linked with,
// compiles one expression and prints one line.

#include <boost/regex.hpp>

#include <iostream>

int main() {
    const boost::regex name("[a-z]+");
    std::cout << boost::regex_match("kelvash", name) << std::endl;
}
