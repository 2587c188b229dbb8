// The models and the areas that a configuration tool offers in each.
#include <gtest/gtest.h>

#include "tests/unit/description/Document.h"

namespace description_test {
namespace {

struct Offer {
    std::string name;
    int min;
    int max;
};

struct ModelRow {
    std::string name;
    std::string display;
    std::vector<Offer> offers;
};

const std::vector<ModelRow> models{
    {"1",
     "Modicon Modbus(1-based)",
     {{"INP", 100001, 165536},
      {"OUTP", 1, 65536},
      {"HREG", 400001, 465536},
      {"IREG", 300001, 365536}}},
    {"2",
     "Generic Modbus(0-based)",
     {{"INP", 100000, 165535}, {"OUTP", 0, 65535}, {"HREG", 400000, 465535}}},
    {"3",
     "Enron Modbus(1-based) with 32bit registers",
     {{"INP", 100001, 165536},
      {"OUTP", 1, 65536},
      {"HREG", 400001, 465536},
      {"IREG", 300001, 365536},
      {"LONG", 0, 65535},
      {"NO", 0, 1},
      {"NP_Mode", 0, 0},
      {"SP_Baud", 0, 0},
      {"SP_Par", 0, 0},
      {"SP_Stop", 0, 0},
      {"SP_Mode", 0, 0},
      {"SP_Done", 0, 0}}},
    {"4",
     "Enron Modbus(0-based) with 32bit registers",
     {{"INP", 100000, 165535},
      {"OUTP", 0, 65535},
      {"HREG", 400000, 465535},
      {"IREG", 300000, 365535},
      {"LONG", 0, 65535},
      {"NO", 0, 1},
      {"NP_Mode", 0, 0},
      {"SP_Baud", 0, 0},
      {"SP_Par", 0, 0},
      {"SP_Stop", 0, 0},
      {"SP_Mode", 0, 0},
      {"SP_Done", 0, 0}}},
};

TEST(ModelsTest, ModelsStandInOrder) {
    EXPECT_EQ((std::vector<std::string>{"1", "2", "3", "4"}), childTexts(root().child("models")));
}

TEST(ModelsTest, ModelsCarryTheirDisplayTextAndNoDatagrams) {
    for (const ModelRow& model : models) {
        const auto element = childWithText(root().child("models"), model.name);
        EXPECT_STREQ("model", element.name());
        EXPECT_EQ((Attributes{
                      {"display", model.display}, {"datagramCount", "0"}, {"datagramLength", "0"}}),
                  attributesOf(element))
            << model.name;
    }
}

TEST(ModelsTest, AreasStandInOrderWithTheirRanges) {
    for (const ModelRow& model : models) {
        const auto element = childWithText(root().child("models"), model.name);
        std::vector<std::string> names;
        for (const Offer& offer : model.offers)
            names.push_back(offer.name);
        EXPECT_EQ(names, childTexts(element)) << "model " << model.name;
        for (const Offer& offer : model.offers) {
            const auto reference = childWithText(element, offer.name);
            EXPECT_STREQ("memtype_ref", reference.name());
            EXPECT_EQ((Attributes{{"min", std::to_string(offer.min)},
                                  {"max", std::to_string(offer.max)}}),
                      attributesOf(reference))
                << "model " << model.name << ", " << offer.name;
        }
    }
}

}  // namespace
}  // namespace description_test
