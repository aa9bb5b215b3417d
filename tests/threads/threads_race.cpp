// Two threads use one object, and at least one of them changes it: no program may do that, and the
// thread sanitizer must see it. usage: threads_race RACE, the name of an entry of kRaces.
#include <atomic>
#include <cstring>
#include <thread>

#include <Kq_BoolEquation.h>

namespace {

struct Objects {
    Kq_BoolEquation equation{"A & B"};
    Kq_BoolEquation other{"C ^ (D | E)"};
    Kq_BoolEquation::TruthTable table{Kq_BoolEquation("A | B")};
};

struct Race {
    const char* name;
    void (*first)(Objects& objects);
    void (*second)(Objects& objects);
};

void Set(Objects& o)
{
    o.equation.SetEquation("A & ~B");
}

const Race kRaces[] = {
    {"set_and_set", Set, Set},
    {"set_and_ask", Set, [](Objects& o) { o.equation.GetEquation(false); }},
    {"value_and_eval", [](Objects& o) { o.equation.SetVariable("A", 1); },
     [](Objects& o) { o.equation.Eval(); }},
    {"assign_and_copy", [](Objects& o) { o.equation = o.other; },
     [](Objects& o) { const Kq_BoolEquation copy(o.equation); }},
    {"define_and_list", [](Objects& o) { o.equation.DefineVariable("C", 1); },
     [](Objects& o) { o.equation.GetInitValueTermEquation(); }},
    {"table_and_rows", [](Objects& o) { o.table = o.other; },
     [](Objects& o) { o.table.GetRows(); }},
};

void Run(const Race& race)
{
    Objects objects;
    std::atomic<int> numReady{0};
    const auto repeat = [&objects, &numReady](void (*use)(Objects&)) {
        for (++numReady; numReady < 2;)
            std::this_thread::yield();
        for (int round = 0; round < 1000; ++round)
            use(objects);
    };
    std::thread other([&] { repeat(race.first); });
    repeat(race.second);
    other.join();
}

} // namespace

int main(int argc, char** argv)
{
    for (const Race& race : kRaces) {
        if (argc == 2 && std::strcmp(argv[1], race.name) == 0) {
            Run(race);
            return 0;
        }
    }
    return 2;
}
