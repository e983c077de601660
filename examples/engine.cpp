#include <iostream>
#include <tevpf.hpp>

int main() try {
  auto file = tevpf::File::open_or_create("engine.pf");
  if (file.is_new()) {
    auto engine = file.create_list("Engine", "First stage engine");
    engine.add(tevpf::Parameter("Thrust", 480.0)
                   .units("kN")
                   .bounds(0, 800)
                   .precision(5)
                   .description("At sea level"));
    auto tests = file.create_table("Tests", "Firings on the stand");
    tests.add_column(tevpf::Column("number", tevpf::Type::int16).unique());
    tests.add_column(tevpf::Column("seconds", tevpf::Type::float64).bounds(0, 600).indexed());
    tests.append({1, 12.5});
    tests.append({2, 168.0});
    tests.append({3, 3.25});
  }

  auto engine = file.list("Engine");
  std::cout << "Thrust is " << engine.get<double>("Thrust") << " kN\n";
  try {
    engine.set("Thrust", 900);
  } catch (const tevpf::Error& refusal) {
    std::cout << refusal.what() << "; the value is as before\n";
  }

  auto tests = file.table("Tests");
  for (auto [number, seconds] :
       tests.ordered_by("seconds").fields<std::int16_t, double>("number", "seconds")) {
    std::cout << "Test " << number << ": " << seconds << " s\n";
  }
  if (auto second = tests.find("number", 2)) {
    std::cout << "The second one took " << second->get<double>("seconds") << " s\n";
  }
  file.save();
} catch (const std::exception& error) {
  std::cerr << error.what() << '\n';
  return 1;
}
