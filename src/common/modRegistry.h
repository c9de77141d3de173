#pragma once
// String values of the registry for the rest of the component: the connection settings
// and the header editor's remembered journal and date. A key is addressed by one full
// path that begins with a root key's name ("HKEY_LOCAL_MACHINE\SOFTWARE\Quorvex\POC").
//
// A plain module with module-level state (the handles of the last parse and the last
// open, the last result, the read buffer): it is not reentrant and runs on the
// user-interface thread only. Registry failures are not reported: reads give Null and
// writes false, and the status stays in the last result. Other errors are reported
// under "modRegistry"; reads then give Empty and writes false.

#include <cstdint>
#include <string>

#include "platform/registry/Registry.h"
#include "platform/vb/Variant.h"

namespace common {

// Bytes a value may take, its terminating zero included; longer values read as Null.
inline constexpr uint32_t kRegistryBufferSize = 3500;
// "SREF=" redirections followed before a chain is taken for a cycle and read as Null.
inline constexpr int kRegistryMaxRedirections = 32;

// The predefined handle of a root key name, in its exact letter case; 0 for any other.
registry::HKEY ObterHandleChavePrincipal(const std::string& nome);

// Splits a full path into its root handle and (left in chave) the subkey path. A path
// that does not begin with "HKEY_" or ends with "\" is shown as "Formato Incorrecto:"
// and gives root 0; so does a root name not known.
void FormatarChave(std::string& chave, registry::HKEY& raiz);

// One string value: Empty for a malformed path or unknown root, Null when the key or
// the value is missing or too long, else the text without its leading blanks.
vb::Variant ValorString(const std::string& chave, const std::string& nomeValor);

// As ValorString, following values of the form "SREF=" and another full path to the
// value of the same name there. What the rest of the component reads with.
vb::Variant ObterValorString(const std::string& chave, const std::string& nomeValor);

// Writes one string value to an existing key (a missing key is not created); true on
// success.
bool DefinirValorString(const std::string& chave, const std::string& nomeValor,
                        const std::string& valor);

// The module's last result: the position (1-based, 0 for none) of the first "\" found
// by the last path parse, then the status of the last registry call (0 = success).
int32_t RegistryLastResult();

}  // namespace common
