#include "benchmarks/peers.h"

#include "benchmarks/child.h"

namespace bench {
namespace {

void addPeer(std::vector<Contender>& contenders, const Context& context, Interpreter& interpreter,
             const std::string& peer, const std::vector<std::string>& call) {
    if (!interpreter.isThere()) return;
    const std::string saved = context.path("peer.result");
    contenders.push_back({peer, [=, &interpreter](Trial& trial) {
                              std::vector<std::string> fields = call;
                              fields.push_back(trial.compares() ? saved : "-");
                              trial.addSeconds(interpreter.seconds(fields));
                              trial.resultOfFile(saved);
                          }});
}

}  // namespace

void addPython(std::vector<Contender>& contenders, Context& context, const std::string& peer,
               const std::vector<std::string>& call) {
    addPeer(contenders, context, context.python(), peer, call);
}

void addR(std::vector<Contender>& contenders, Context& context,
          const std::vector<std::string>& call) {
    addPeer(contenders, context, context.r(), "r", call);
}

}  // namespace bench
