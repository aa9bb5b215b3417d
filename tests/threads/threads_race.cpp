// Two threads without a lock, on equations that look independent: what README says not to do.
// usage: threads_race names|copies|program: what they share unknowingly.
#include <string>
#include <thread>

#include <Kq_BoolEquation.h>

int main(int argc, char** argv)
{
    const std::string race = argc == 2 ? argv[1] : "";
    Kq_BoolEquation first("A & B");
    Kq_BoolEquation second(first);
    if (race == "names")
        first.SetEquation("C"); // nodes of its own: the pool of names is left

    const auto use = [&race](Kq_BoolEquation& equation) {
        for (int round = 0; round < 1000; ++round) {
            if (race == "names") {
                equation.SetEquation(("name" + std::to_string(round)).c_str());
            } else if (race == "copies") {
                const Kq_BoolEquation copy(equation); // counts the holders of the nodes
            } else {
                equation.Eval(); // const, but keeps what it finds out with the nodes
            }
        }
    };
    std::thread other([&] { use(first); });
    use(second);
    other.join();
    return 0;
}
