#pragma once
// The verbs of the dorvantos command line. Each takes the arguments after its verb and
// returns the exit status: 0 done, 1 failed, 2 wrong arguments (usage printed).

#include <string>
#include <vector>

namespace app {

using Args = std::vector<std::string>;

int RunEditor(const Args& args);     // [--user U] [--password P] [--open ID | --line ID]
int RunReg(const Args& args);         // reg query|add|delete|import|export
int RunRegister(const Args& args);    // register [LIBRARY...]
int RunUnregister(const Args& args);  // unregister [LIBRARY...]
int RunUser(const Args& args);        // user add NAME [--password TEXT] [--db PATH]
int RunSetupDemo(const Args& args);   // setup-demo [--db PATH] [--registry PATH] [--user NAME]
                                      //            [--password TEXT] [--force]
int RunSetupServer(const Args& args);  // setup-server --server SOURCE --admin-user NAME ...
int RunEncodePassword(const Args& args);  // encode-password TEXT
int RunAutomate(const Args& args);        // automate [--registry PATH]
int RunDemo(const Args& args);            // demo [--user NAME] [--password TEXT]

}  // namespace app
