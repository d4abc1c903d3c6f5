// Writes what the Windows build needs from the interface tables: "idl" prints the interface definition as the IDL
// compiler needs it for the type library, "header" the header for C++ programs, "manifest" and "manifest64" the
// manifest for use without registration. Built for the build machine, even when the library itself is built for
// Windows.
#include <cstdio>
#include <string>
#include <string_view>

#include "library/cpp_header.hpp"
#include "library/identity.hpp"
#include "library/interface_definition.hpp"
#include "library/version.hpp"

namespace {

using namespace talutil;

/// Without a threading model: objects live in the program's first apartment, and calls from others are marshalled
/// there.
std::string class_entry(const identity::Class& entry) {
  return "    <comClass clsid=\"{" + std::string(entry.identifier) + "}\" progid=\"" + std::string(entry.program_id) +
         "\" tlbid=\"{" + std::string(identity::type_library) + "}\"/>\n";
}

/// How calls of an interface are marshalled to another apartment: by the platform's marshaller for type libraries,
/// whose class identifier is a platform constant (PSOAInterface).
std::string interface_entry(std::string_view name, std::string_view identifier) {
  return "  <comInterfaceExternalProxyStub name=\"" + std::string(name) + "\" iid=\"{" + std::string(identifier) +
         "}\" proxyStubClsid32=\"{00020424-0000-0000-C000-000000000046}\" numMethods=\"7\" tlbid=\"{" +
         std::string(identity::type_library) + "}\"/>\n";
}

std::string manifest(const std::string& processor) {
  std::string classes;
  for (const identity::Class& entry : identity::classes) classes += class_entry(entry);
  return "<?xml version=\"1.0\" encoding=\"UTF-8\" standalone=\"yes\"?>\n"
         "<assembly xmlns=\"urn:schemas-microsoft-com:asm.v1\" manifestVersion=\"1.0\">\n"
         "  <assemblyIdentity type=\"win32\" name=\"TALUtil\" version=\"" +
         std::string(version_text) + ".0\" processorArchitecture=\"" + processor +
         "\"/>\n"
         "  <file name=\"TALUtil.dll\">\n" +
         classes + "    <typelib tlbid=\"{" + std::string(identity::type_library) + "}\" version=\"" +
         std::to_string(identity::type_library_major) + "." + std::to_string(identity::type_library_minor) +
         "\" helpdir=\"\"/>\n  </file>\n" + interface_entry("_ORVUtils", identity::orv_utils_interface) +
         interface_entry("_cControlPosition", identity::control_position_interface) + "</assembly>\n";
}

}  // namespace

int main(int argc, char** argv) {
  const std::string_view what = argc == 2 ? argv[1] : "";
  std::string text;
  if (what == "idl") text = "import \"base.idl\";\n\n" + interface_definition(Dialect::type_library);
  if (what == "header") text = cpp_header();
  if (what == "manifest") text = manifest("x86");
  if (what == "manifest64") text = manifest("amd64");
  if (text.empty()) {
    std::fputs("usage: write_idl idl|header|manifest|manifest64\n", stderr);
    return 2;
  }
  return std::fputs(text.c_str(), stdout) < 0 ? 1 : 0;
}
