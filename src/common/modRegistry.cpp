#include "common/modRegistry.h"

#include <string_view>

#include "common/ErrorTrap.h"
#include "platform/forms/Desktop.h"

namespace common {

namespace {

using registry::HKEY;

// The module-level state every procedure shares.
struct ModuleState {
  HKEY chavePrincipal = 0;  // root found by the last path parse
  HKEY chaveAberta = 0;     // the key currently open
  int32_t resultado = 0;    // last result
  std::string buffer;       // the read buffer and the length the last read filled
  uint32_t bufferLen = 0;
};

ModuleState& Module() {
  static ModuleState state;
  return state;
}

// Closes the open key on every path: a failed read or write must not leave its handle
// open, or each failure would leak one. The status of the call that failed is the one
// kept in the last result.
void FecharChave() {
  ModuleState& m = Module();
  if (m.chaveAberta != 0) registry::RegCloseKey(m.chaveAberta);
  m.chaveAberta = 0;
}

std::string SemBrancosIniciais(std::string_view text) {
  size_t first = text.find_first_not_of(' ');
  return first == std::string_view::npos ? std::string() : std::string(text.substr(first));
}

bool ERedireccao(const vb::Variant& valor) {
  return valor.IsString() && valor.AsString().starts_with("SREF=");
}

}  // namespace

HKEY ObterHandleChavePrincipal(const std::string& nome) {
  for (HKEY root = registry::HKEY_CLASSES_ROOT; root <= registry::HKEY_DYN_DATA; ++root)
    if (registry::RootName(root) == nome) return root;
  return 0;
}

void FormatarChave(std::string& chave, HKEY& raiz) {
  raiz = 0;
  Trap(RegistrySite("FormatarChave"), [&] {
    ModuleState& m = Module();
    size_t barra = chave.find('\\');
    m.resultado = barra == std::string::npos ? 0 : static_cast<int32_t>(barra + 1);
    m.chavePrincipal = 0;
    if (!chave.starts_with("HKEY_") || chave.ends_with('\\')) {
      forms::MsgBox("Formato Incorrecto:\n\n" + chave, forms::vbOKOnly, forms::ApplicationTitle());
      return;
    }
    if (barra == std::string::npos) {
      m.chavePrincipal = ObterHandleChavePrincipal(chave);
      chave.clear();
    } else {
      m.chavePrincipal = ObterHandleChavePrincipal(chave.substr(0, barra));
      chave.erase(0, barra + 1);
    }
    raiz = m.chavePrincipal;
  });
}

vb::Variant ValorString(const std::string& chave, const std::string& nomeValor) {
  vb::Variant resultado;
  Trap(RegistrySite("ValorString"), [&] {
    ModuleState& m = Module();
    std::string subChave = chave;
    HKEY raiz = 0;
    FormatarChave(subChave, raiz);
    if (raiz == 0) return;

    m.resultado = registry::RegOpenKeyEx(raiz, subChave, 0, registry::KEY_READ, &m.chaveAberta);
    if (m.resultado != registry::ERROR_SUCCESS) {
      resultado = vb::Variant::Null();
      return;
    }
    // Whatever the value's type; data longer than the buffer fails with ERROR_MORE_DATA.
    m.buffer.assign(kRegistryBufferSize, ' ');
    m.bufferLen = kRegistryBufferSize;
    uint32_t tipo = 0;
    m.resultado = registry::RegQueryValueEx(m.chaveAberta, nomeValor, &tipo, m.buffer.data(),
                                            &m.bufferLen);
    FecharChave();
    if (m.resultado != registry::ERROR_SUCCESS) {
      resultado = vb::Variant::Null();
      return;
    }
    // The leading blanks go, then the last character: the terminating zero.
    std::string texto = SemBrancosIniciais(std::string_view(m.buffer).substr(0, m.bufferLen));
    if (!texto.empty()) texto.pop_back();
    resultado = std::move(texto);
  });
  return resultado;
}

vb::Variant ObterValorString(const std::string& chave, const std::string& nomeValor) {
  vb::Variant resultado;
  Trap(RegistrySite("ObterValorString"), [&] {
    vb::Variant valor = ValorString(chave, nomeValor);
    // A chain that leads back to a key already visited would never end; after this
    // many redirections it is taken for one, and the value for missing (Null) rather
    // than handing out a "SREF=" text as if it were the setting.
    int redireccoes = 0;
    while (ERedireccao(valor)) {
      if (++redireccoes > kRegistryMaxRedirections) {
        valor = vb::Variant::Null();
        break;
      }
      valor = ValorString(valor.AsString().substr(5), nomeValor);
    }
    resultado = std::move(valor);
  });
  return resultado;
}

bool DefinirValorString(const std::string& chave, const std::string& nomeValor,
                        const std::string& valor) {
  bool resultado = false;
  Trap(RegistrySite("DefinirValorString"), [&] {
    ModuleState& m = Module();
    std::string subChave = chave;
    HKEY raiz = 0;
    FormatarChave(subChave, raiz);
    if (raiz == 0) return;

    // Opened, never created: only setup and registration tools create keys.
    m.resultado = registry::RegOpenKeyEx(raiz, subChave, 0, registry::KEY_WRITE, &m.chaveAberta);
    if (m.resultado != registry::ERROR_SUCCESS) return;
    m.resultado = registry::RegSetValueEx(m.chaveAberta, nomeValor, registry::REG_SZ,
                                          valor.c_str(),
                                          static_cast<uint32_t>(valor.size() + 1));
    FecharChave();
    resultado = m.resultado == registry::ERROR_SUCCESS;
  });
  return resultado;
}

int32_t RegistryLastResult() { return Module().resultado; }

}  // namespace common
